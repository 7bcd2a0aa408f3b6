// Host error exceptions and their texts, the check after host calls and the host-array checks:
// what they raise and from where; host errors as the statuses of the exported functions.
#include "host/errors/ThrowIfWBError.h"

#include "host/errors/HostErrorToHResult.h"
#include "host/errors/WBErrorException.h"
#include "runtime/HandleTable.h"

#include <gtest/gtest.h>
#include <string>

using qv::host::errors::CheckArrayIndex;
using qv::host::errors::CheckNewArraySize;
using qv::host::errors::HostErrorToHResult;
using qv::host::errors::ThrowIfNoHandle;
using qv::host::errors::ThrowIfWBError;
using qv::host::errors::WBErrorException;

namespace {

std::string MessageOf(void (*raise)()) {
    try {
        raise();
    } catch (const WBErrorException& error) {
        return error.what();
    }
    return "(nothing raised)";
}

TEST(ThrowIfWBError, RaisesNonZeroCodesWithItsLocationAndHostArrayChecksRaiseOnBoundsAndSizes) {
    EXPECT_NO_THROW(ThrowIfWBError(0));
    try {
        ThrowIfWBError(53);
        FAIL() << "53 must raise";
    } catch (const qv::kern::exception::Exception& error) {
        const auto* hostError = dynamic_cast<const WBErrorException*>(&error);
        ASSERT_NE(hostError, nullptr);
        EXPECT_EQ(hostError->code(), 53);
        EXPECT_NE(std::string(error.file()).find("ThrowIfWBError.cpp"), std::string::npos);
        EXPECT_GT(error.line(), 0u);
        const WBErrorException copy = *hostError;
        EXPECT_EQ(copy.file(), error.file());
        EXPECT_EQ(copy.line(), error.line());
        EXPECT_STREQ(copy.what(), error.what());
    }
    // Host array checks raise on bounds and sizes.
    EXPECT_NO_THROW(CheckArrayIndex(2, 3));
    EXPECT_EQ(MessageOf([] { CheckArrayIndex(3, 3); }),
              "Error Code: 1 (00000001): Array index out of bounds.");
    EXPECT_EQ(MessageOf([] { CheckArrayIndex(-1, 3); }),
              "Error Code: 1 (00000001): Array index out of bounds.");
    EXPECT_EQ(MessageOf([] { CheckArrayIndex(0, 0); }),
              "Error Code: 1 (00000001): Array index out of bounds.");
    EXPECT_NO_THROW(CheckNewArraySize(0));
    EXPECT_EQ(MessageOf([] { CheckNewArraySize(-1); }),
              "Error Code: 1 (00000001): Invalid new_size for array.");
    EXPECT_EQ(MessageOf([] { ThrowIfNoHandle(nullptr); }),
              "Error Code: 2 (00000002): The host ran out of memory.");
}

TEST(HostErrorToHResult, MapsTheTableElseGeneralFailureAndExceptionsNameTheCodeAndTheHostsText) {
    EXPECT_EQ(HostErrorToHResult(0), 0);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(1)), 0x80070057u);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(2)), 0x8007000Eu);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(7)), 0x80030002u);
    EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(53)), 0x80004001u);
    for (const int32_t other : {-1, 3, 42, 54, 0x7FFFFFFF}) {
        EXPECT_EQ(static_cast<uint32_t>(HostErrorToHResult(other)), 0x80004005u) << other;
    }
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
    const WBErrorException text("Array index out of bounds.");
    EXPECT_STREQ(text.what(), "Error Code: 1 (00000001): Array index out of bounds.");
    EXPECT_EQ(text.GetErrorCode(), 1u);
    EXPECT_STREQ(WBErrorException(static_cast<const char*>(nullptr)).what(),
                 "Error Code: 1 (00000001): ");
}

} // namespace
