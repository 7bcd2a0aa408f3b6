// OS errors: errno to Windows code to host code, the system's text, and "Unknown error" where
// the system has none.
#include "kern/osdep/OSException.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <gtest/gtest.h>

using qv::kern::osdep::OSException;
using qv::kern::osdep::WinError;

TEST(OSException, WindowsCodesAndErrnoMapToHostCodesAndTheSystemsTextCaughtAsTheBase) {
    const OSException e;
    EXPECT_STREQ(e.what(), "Unknown error");
    EXPECT_EQ(e.GetErrorCode(), 42u);
    EXPECT_EQ(e.GetOSErrorCode(), 0u);
    EXPECT_STREQ(OSException("", 3).what(), "Unknown error");
    // One code of each kind: a plain host code, a status kept whole, a negative host code, and
    // codes with no host counterpart, whose text the system cannot give either.
    const struct {
        uint32_t windowsCode;
        uint32_t hostCode;
        const char* text;
    } rows[] = {{2, 7, std::strerror(ENOENT)},
                {5, 0x80070005u, std::strerror(EACCES)},
                {80, 0xFFFFFF9Eu, std::strerror(EEXIST)},
                {1, 42, nullptr},
                {9999, 42, "Unknown error"}};
    for (const auto& row : rows) {
        const WinError e(row.windowsCode);
        EXPECT_EQ(e.GetErrorCode(), row.hostCode) << row.windowsCode;
        EXPECT_EQ(e.GetOSErrorCode(), row.windowsCode);
        if (row.text != nullptr) {
            EXPECT_STREQ(e.what(), row.text) << row.windowsCode;
        }
    }
    // The last error is the failed call's errno; caught as the base of the tree.
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
    try {
        QV_THROW(WinError(5));
    } catch (const qv::kern::exception::Exception& e) {
        EXPECT_EQ(e.GetErrorCode(), 0x80070005u);
        EXPECT_EQ(dynamic_cast<const OSException&>(e).GetOSErrorCode(), 5u);
        EXPECT_NE(e.line(), 0u);
    }
}
