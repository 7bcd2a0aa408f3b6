// The exports that take plain C values (GetInfo, TIO_CompareTwoResourceTrees), called through the
// loaded module as a host calls them.
#include "cli/HostedModule.h"

#include <cstdint>
#include <gtest/gtest.h>
#include <string>

namespace {

using CompareFn = uint32_t(const char*, const char*);

TEST(PlainExports, InfoAnswersFiveCompareTheThreeCodesTakingNullAsEmptyInTheDefaultCodePage) {
    const wbhost::cli::HostedModule module{WBT_MODULE_PATH};
    ASSERT_TRUE(module.Loaded()) << module.Error();
    auto* getInfo = module.Find<int32_t()>("GetInfo");
    auto* compare = module.Find<CompareFn>("TIO_CompareTwoResourceTrees");
    ASSERT_TRUE(getInfo && compare);
    EXPECT_EQ(getInfo(), 5);
    EXPECT_EQ(getInfo(), 5);

    const std::string required = "<IOResource><Direction>Input</Direction></IOResource>";
    const std::string offered =
        "<IOResource><Direction>INPUT</Direction><Pull>up</Pull></IOResource>";
    EXPECT_EQ(compare(nullptr, nullptr), 0u);
    EXPECT_EQ(compare(nullptr, offered.c_str()), 2u);
    EXPECT_EQ(compare(required.c_str(), ""), 1u);
    EXPECT_EQ(compare(required.c_str(), required.c_str()), 0u);
    EXPECT_EQ(compare(required.c_str(), offered.c_str()), 2u);
    EXPECT_EQ(compare(offered.c_str(), required.c_str()), 1u);

    // "\xE9" is e-acute in the default single-byte code page; as UTF-8 bytes it would be invalid.
    const std::string lower = "<IOResource><Name>caf\xE9</Name></IOResource>";
    const std::string upper = "<IOResource><Name>CAF\xC9</Name></IOResource>";
    EXPECT_EQ(compare(lower.c_str(), upper.c_str()), 0u);
}

} // namespace
