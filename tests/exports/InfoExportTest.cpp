// GetInfo, called through the loaded module.
#include "LoadedModule.h"

#include <cstdint>
#include <gtest/gtest.h>

namespace {

TEST(InfoExport, AnswersFiveEveryTime) {
    test::LoadedModule module;
    ASSERT_TRUE(module.Loaded()) << test::LoadedModule::LoadError();
    auto* getInfo = module.Find<int32_t()>("GetInfo");
    ASSERT_NE(getInfo, nullptr);
    EXPECT_EQ(getInfo(), 5);
    EXPECT_EQ(getInfo(), 5);
}

} // namespace
