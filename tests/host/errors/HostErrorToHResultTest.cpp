// Host errors as the statuses of the exported functions.
#include "host/errors/HostErrorToHResult.h"

#include <gtest/gtest.h>

using qv::host::errors::HostErrorToHResult;

namespace {

TEST(HostErrorToHResult, TableAndEverythingElseAsGeneralFailure) {
    EXPECT_EQ(HostErrorToHResult(0), 0);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(1)), 0x80070057u);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(2)), 0x8007000Eu);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(7)), 0x80030002u);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(53)), 0x80004001u);
    for (const int32_t other : {-1, 3, 42, 54, 0x7FFFFFFF}) {
        EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(other)), 0x80004005u) << other;
    }
}

} // namespace
