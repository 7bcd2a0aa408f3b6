// qxGetProvider as a host reaches it: through the real module, loaded with dlopen.
#include "framework/IqxProvider.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

namespace {

using GetProviderFn = HRESULT (*)(int32_t, void**);

class ProviderModule : public ::testing::Test {
protected:
    void SetUp() override {
        module_ = dlopen(WBT_MODULE_PATH, RTLD_NOW | RTLD_LOCAL);
        ASSERT_NE(module_, nullptr) << dlerror();
        get_ = reinterpret_cast<GetProviderFn>(dlsym(module_, "qxGetProvider"));
        ASSERT_NE(get_, nullptr);
    }
    void TearDown() override {
        if (module_) {
            dlclose(module_);
        }
    }
    IqxProvider* Get(int32_t mode) {
        IqxProvider* provider = nullptr;
        EXPECT_EQ(get_(mode, reinterpret_cast<void**>(&provider)), S_OK);
        return provider;
    }

    void* module_ = nullptr;
    GetProviderFn get_ = nullptr;
};

TEST_F(ProviderModule, HandsOutSharedAndPrivateProviders) {
    EXPECT_EQ(get_(0, nullptr), E_POINTER);
    IqxProvider* shared = Get(0);
    IqxProvider* again = Get(0);
    ASSERT_NE(shared, nullptr);
    EXPECT_EQ(shared, again);
    IqxProvider* priv = Get(1);
    EXPECT_NE(priv, shared);
    IqxProvider* fresh = Get(0);
    EXPECT_NE(fresh, shared);
    EXPECT_NE(fresh, priv);

    BSTR name = nullptr;
    const GUID ioType = qv::com::ParseGuid("A117026A-AD51-4C63-8341-085C842E9D22");
    ASSERT_EQ(fresh->GetTypeName(ioType, &name), S_OK);
    // The text was allocated inside the module; its length prefix is readable here.
    EXPECT_EQ(std::u16string(name, reinterpret_cast<const uint32_t*>(name)[-1] / 2), u"Tangent IO");
    free(reinterpret_cast<uint32_t*>(name) - 1);

    for (IqxProvider* p : {shared, again, priv, fresh}) {
        p->Release();
    }
}

} // namespace
