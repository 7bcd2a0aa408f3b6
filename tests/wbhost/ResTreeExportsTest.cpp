// TIOResTree_Dump called through the real module, on a tree of this host's resource service.
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "resources/ResourceService.h"
#include "runtime/Runtime.h"

#include <gtest/gtest.h>

namespace {

using DumpFn = int32_t(const WBRefNum*, WBHandle, WBHandle, uint8_t*);
using wbhost::cli::HostStringBytes;
using wbhost::cli::NewHostString;

class ResTreeExportsTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(module_.Loaded()) << module_.Error();
        dump_ = module_.Find<DumpFn>("TIOResTree_Dump");
        ASSERT_NE(dump_, nullptr);
        target_ = service_.LoadTargetText(
            u"<Target><Connector name=\"C0\"><DigitalLine name=\"DIO0\"><Line>0</Line>"
            u"<Note>caf\u00E9</Note></DigitalLine></Connector></Target>");
        ASSERT_NE(target_, nullptr);
    }

    wbhost::cli::HostedModule module_{WBT_MODULE_PATH};
    DumpFn* dump_ = nullptr;
    wbhost::resources::ResourceService service_;
    wbhost::resources::Target* target_ = nullptr;
};

TEST_F(ResTreeExportsTest, DumpsTheNodeInTheHostsCodePageAndNoNodeLeavesTheTextAlone) {
    const auto text = NewHostString("old");
    uint8_t found = 7;
    EXPECT_EQ(dump_(&target_->refnum, NewHostString("C0/DIO9").get(), text.get(), &found), S_OK);
    EXPECT_EQ(found, 0);
    EXPECT_EQ(HostStringBytes(text.get()), "old");
    ASSERT_EQ(dump_(&target_->refnum, NewHostString("C0/DIO0").get(), text.get(), &found), S_OK);
    EXPECT_EQ(found, 1);
    // "\xE9" is e-acute in the default single-byte code page.
    EXPECT_EQ(HostStringBytes(text.get()), "<DigitalLine name=\"DIO0\">\n  <Line>0</Line>\n"
                                           "  <Note>caf\xE9</Note>\n</DigitalLine>\n");
}

TEST_F(ResTreeExportsTest, BadRefnumsAndArgumentsAnswerFailures) {
    const auto path = NewHostString("");
    const auto text = NewHostString("old");
    uint8_t found = 7;
    const WBRefNum unknown = 0xFFFFFFF0u;
    EXPECT_EQ(dump_(&unknown, path.get(), text.get(), &found), E_INVALIDARG);
    EXPECT_EQ(found, 0);
    EXPECT_EQ(dump_(nullptr, path.get(), text.get(), &found), E_POINTER);
    EXPECT_EQ(dump_(&target_->refnum, path.get(), text.get(), nullptr), E_POINTER);
    EXPECT_EQ(dump_(&target_->refnum, path.get(), nullptr, &found), E_POINTER);
    EXPECT_EQ(HostStringBytes(text.get()), "old");
    // A handle the host never made cannot be written: its host error comes back as a status,
    // with the node already found.
    void* notAHostBlock = nullptr;
    EXPECT_EQ(dump_(&target_->refnum, path.get(), &notAHostBlock, &found), E_INVALIDARG);
    EXPECT_EQ(found, 1);
    // A null path handle reads as the empty path: the root.
    EXPECT_EQ(dump_(&target_->refnum, nullptr, text.get(), &found), S_OK);
    EXPECT_EQ(found, 1);
    EXPECT_EQ(HostStringBytes(text.get()).substr(0, 8), "<Target ");
}

} // namespace
