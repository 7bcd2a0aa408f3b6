// Host strings written and read through the real host runtime, whose blocks move on resize.
#include "host/HostString.h"

#include "host/errors/WBErrorException.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <gtest/gtest.h>

using qv::host::HostString;
using qv::host::ReadHostString;
using qv::host::WriteHostString;

namespace {

TEST(HostString, WriteAllocatesGrowsAndReadsBackEveryByte) {
    HostString text = nullptr;
    WriteHostString(text, "abc");
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(ReadHostString(text), "abc");

    const void* const before = *text;
    const std::string longer("with\0zero and more bytes", 24);
    WriteHostString(text, longer);
    EXPECT_NE(*text, before) << "the host moved the block";
    EXPECT_EQ(ReadHostString(text), longer);

    WriteHostString(text, "");
    EXPECT_EQ(ReadHostString(text), "");
    EXPECT_EQ(DSGetHandleSize(text), 4u);
    EXPECT_EQ(DSDisposeHandle(text), 0);
}

TEST(HostString, AbsentOrNonPositiveCountsReadAsEmpty) {
    EXPECT_EQ(ReadHostString(nullptr), "");
    HostString text = DSNewHClr(8);
    const int32_t negative = -3;
    std::memcpy(*text, &negative, sizeof negative);
    EXPECT_EQ(ReadHostString(text), "");
    DSDisposeHandle(text);
}

TEST(HostString, HandleTheHostDoesNotKnowRaisesItsError) {
    void* bogusData = nullptr;
    HostString bogus = &bogusData;
    try {
        WriteHostString(bogus, "x");
        FAIL() << "an unknown handle must not be written";
    } catch (const qv::host::errors::WBErrorException& error) {
        EXPECT_EQ(error.code(), 1);
    }
}

} // namespace
