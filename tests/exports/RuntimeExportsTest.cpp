// The exports through which a host names its runtime, called as a host calls them: the module's
// host calls then bind in the module (or the thread's module) that the host named.
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "runtime/Runtime.h"

#include <cstdint>
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <pthread.h>
#include <thread>

namespace {

using SetModule = void(void*);
using SetTlsIndex = void(uint32_t);
using Hook = void();
using MbsToWcs = int32_t(WBHandle, WBHandle);

// Converts "A" through the module, which writes the result with the host's NumericArrayResize.
int32_t ConvertOnce(MbsToWcs* mbstowcs) {
    const auto in = wbhost::cli::NewHostString("A");
    const auto out = wbhost::cli::NewHostString("");
    const int32_t status = mbstowcs(in.get(), out.get());
    return status == 0 && wbhost::cli::HostStringBytes(out.get()) == std::string("A\0", 2) ? 0 : -1;
}

TEST(RuntimeExports, TheNamedModuleOrTheThreadsOwnServesTheModulesHostCalls) {
    const wbhost::cli::HostedModule module{WBT_MODULE_PATH};
    ASSERT_TRUE(module.Loaded()) << module.Error();
    auto* setModule = module.Find<SetModule>("SetWBRTModule");
    auto* setTlsIndex = module.Find<SetTlsIndex>("SetWBRTTLSIndex");
    auto* moduleHook = module.Find<Hook>("SetWBRTModuleHook");
    auto* tlsHook = module.Find<Hook>("SetWBRTTLSIndexHook");
    auto* mbstowcs = module.Find<MbsToWcs>("TIO_mbstowcs");
    ASSERT_TRUE(setModule && setTlsIndex && moduleHook && tlsHook && mbstowcs);
    // Both hooks are one empty body that a host may interpose on.
    EXPECT_EQ(reinterpret_cast<void*>(moduleHook), reinterpret_cast<void*>(tlsHook));
    moduleHook();

    // This test program is the host runtime; naming it explicitly changes nothing for callers.
    void* self = dlopen(nullptr, RTLD_NOW);
    setModule(self);
    EXPECT_EQ(ConvertOnce(mbstowcs), 0);

    // A thread whose slot names the runtime is served by it; one whose slot is empty falls back
    // on the module named for every thread.
    pthread_key_t key;
    ASSERT_EQ(pthread_key_create(&key, nullptr), 0);
    setTlsIndex(static_cast<uint32_t>(key));
    int32_t withSlot = -1;
    int32_t withoutSlot = -1;
    std::thread([&] {
        pthread_setspecific(key, self);
        withSlot = ConvertOnce(mbstowcs);
    }).join();
    std::thread([&] { withoutSlot = ConvertOnce(mbstowcs); }).join();
    EXPECT_EQ(withSlot, 0);
    EXPECT_EQ(withoutSlot, 0);

    setTlsIndex(0xFFFFFFFFu);
    setModule(nullptr);
    pthread_key_delete(key);
    dlclose(self);
    EXPECT_EQ(ConvertOnce(mbstowcs), 0);
}

} // namespace
