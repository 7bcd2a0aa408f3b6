// OS errors: errno to Windows code to host code, the system's text, and "Unknown error" where
// the system has none.
#include "kern/osdep/OSException.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <gtest/gtest.h>

using qv::kern::osdep::OSException;
using qv::kern::osdep::WinError;

TEST(OSException, DefaultsToUnknownErrorAndHostCode42) {
    const OSException e;
    EXPECT_STREQ(e.what(), "Unknown error");
    EXPECT_EQ(e.GetErrorCode(), 42u);
    EXPECT_EQ(e.GetOSErrorCode(), 0u);
    EXPECT_STREQ(OSException("", 3).what(), "Unknown error");
}

TEST(OSException, WindowsCodesMapToHostCodes) {
    const struct {
        uint32_t windowsCode;
        uint32_t hostCode;
    } rows[] = {{0, 0},
                {2, 7},
                {3, 7},
                {15, 7},
                {4, 11},
                {5, 0x80070005u},
                {6, 1},
                {87, 1},
                {8, 2},
                {14, 2},
                {11, 23},
                {16, 8},
                {19, 8},
                {32, 8},
                {33, 8},
                {20, 37},
                {23, 0xFFFFFE04u},
                {38, 4},
                {39, 9},
                {80, 0xFFFFFF9Eu},
                {1, 42},
                {9999, 42}};
    for (const auto& row : rows) {
        const WinError e(row.windowsCode);
        EXPECT_EQ(e.GetErrorCode(), row.hostCode) << row.windowsCode;
        EXPECT_EQ(e.GetOSErrorCode(), row.windowsCode);
    }
}

TEST(OSException, TextComesFromTheSystemOrStaysUnknown) {
    EXPECT_STREQ(WinError(2).what(), std::strerror(ENOENT));
    EXPECT_STREQ(WinError(80).what(), std::strerror(EEXIST));
    // A code the system cannot describe keeps the default text and still maps.
    const WinError unknown(9999);
    EXPECT_STREQ(unknown.what(), "Unknown error");
    EXPECT_EQ(unknown.GetErrorCode(), 42u);
}

TEST(OSException, LastErrorIsTheFailedCallsErrno) {
    ASSERT_EQ(::open("/nonexistent/dir/file", O_RDONLY), -1);
    const WinError notFound;
    EXPECT_EQ(notFound.GetOSErrorCode(), 2u);
    EXPECT_EQ(notFound.GetErrorCode(), 7u);
    EXPECT_STREQ(notFound.what(), std::strerror(ENOENT));
    // EPERM and EACCES share one Windows code; the text still names the real cause.
    errno = EPERM;
    const WinError denied;
    EXPECT_EQ(denied.GetOSErrorCode(), 5u);
    EXPECT_STREQ(denied.what(), std::strerror(EPERM));
    errno = ENOSPC;
    EXPECT_EQ(WinError().GetErrorCode(), 9u);
    // An errno without a Windows counterpart becomes a general failure.
    errno = ENOTSOCK;
    EXPECT_EQ(WinError().GetOSErrorCode(), 31u);
}

TEST(OSException, CaughtAsTheBaseOfTheTree) {
    try {
        QV_THROW(WinError(5));
    } catch (const qv::kern::exception::Exception& e) {
        EXPECT_EQ(e.GetErrorCode(), 0x80070005u);
        EXPECT_EQ(dynamic_cast<const OSException&>(e).GetOSErrorCode(), 5u);
        EXPECT_NE(e.line(), 0u);
    }
}
