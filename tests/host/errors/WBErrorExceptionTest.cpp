// Host error exceptions: their texts with and without a host text, and their codes.
#include "host/errors/WBErrorException.h"

#include "runtime/HandleTable.h"

#include <gtest/gtest.h>
#include <string>

using qv::host::errors::WBErrorException;

namespace {

TEST(WBErrorException, PrefixHoldsTheCodeInDecimalAndHexWithTheHostsTextOrTheFallback) {
    const auto& handles = wbhost::runtime::HandleTable::Instance();
    const size_t liveBefore = handles.LiveCount();

    EXPECT_STREQ(WBErrorException(7).what(),
                 "Error Code: 7 (00000007): The file or folder was not found.");
    EXPECT_STREQ(WBErrorException(-1).what(),
                 "Error Code: -1 (ffffffff): Unknown error code or error text unavailable.");
    EXPECT_STREQ(WBErrorException(123456).what(),
                 "Error Code: 123456 (0001e240): Unknown error code or error text unavailable.");
    EXPECT_EQ(handles.LiveCount(), liveBefore) << "the host's text handles are given back";

    const WBErrorException negative(-1);
    EXPECT_EQ(negative.GetErrorCode(), 0xFFFFFFFFu);
    EXPECT_EQ(negative.code(), -1);
}

TEST(WBErrorException, TextFormCarriesCodeOne) {
    const WBErrorException text("Array index out of bounds.");
    EXPECT_STREQ(text.what(), "Error Code: 1 (00000001): Array index out of bounds.");
    EXPECT_EQ(text.GetErrorCode(), 1u);
    EXPECT_STREQ(WBErrorException(static_cast<const char*>(nullptr)).what(),
                 "Error Code: 1 (00000001): ");
}

} // namespace
