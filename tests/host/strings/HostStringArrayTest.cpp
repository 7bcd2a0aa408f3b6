// Host strings and string arrays written and read through the real host runtime, whose blocks
// move on resize: bounds, resizing in both directions, and arrays the host made itself.
#include "host/HostStringArray.h"

#include "host/HostString.h"
#include "host/errors/WBErrorException.h"
#include "runtime/HandleTable.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace qv::host;
using qv::host::errors::WBErrorException;

namespace {

std::string Raised(const std::function<void()>& action) {
    try {
        action();
    } catch (const WBErrorException& error) {
        return error.what();
    }
    return "(nothing raised)";
}

size_t LiveHandles() {
    return wbhost::runtime::HandleTable::Instance().LiveCount();
}

void Release(HostStringArray array) {
    ResizeHostStringArray(array, 0);
    DSDisposeHandle(array);
}

constexpr const char kOutOfBounds[] = "Error Code: 1 (00000001): Array index out of bounds.";

TEST(HostStringArray, ArraysGrowIntoEmptyStringsShrinkByReleasingAndHostMadeOnesAreSafe) {
    HostStringArray array = nullptr;
    EXPECT_EQ(HostStringArrayCount(array), 0);
    EXPECT_EQ(Raised([&] { HostStringArrayElement(array, 0); }), kOutOfBounds);

    ResizeHostStringArray(array, 3);
    ASSERT_NE(array, nullptr);
    EXPECT_EQ(HostStringArrayCount(array), 3);
    EXPECT_EQ(DSGetHandleSize(array), 8u + 8u * 3u);
    for (int32_t i = 0; i < 3; ++i) {
        EXPECT_NE(HostStringArrayElement(array, i), nullptr) << i;
        EXPECT_EQ(ReadHostStringArrayElement(array, i), "");
    }
    EXPECT_EQ(Raised([&] { HostStringArrayElement(array, 3); }), kOutOfBounds);
    EXPECT_EQ(Raised([&] { HostStringArrayElement(array, -1); }), kOutOfBounds);
    Release(array);
    array = nullptr;
    WriteHostStringArray(array, {"one", "two", "three"});
    const HostString first = HostStringArrayElement(array, 0);
    const void* const block = *array;
    const size_t live = LiveHandles();

    ResizeHostStringArray(array, 3);
    EXPECT_EQ(*array, block);
    EXPECT_EQ(HostStringArrayElement(array, 0), first);
    EXPECT_EQ(LiveHandles(), live);

    ResizeHostStringArray(array, 1);
    EXPECT_EQ(LiveHandles(), live - 2);
    EXPECT_EQ(ReadHostStringArray(array), std::vector<std::string>{"one"});
    EXPECT_EQ(Raised([&] { ResizeHostStringArray(array, -1); }),
              "Error Code: 1 (00000001): Invalid new_size for array.");
    EXPECT_EQ(HostStringArrayCount(array), 1) << "a refused size changes nothing";

    WriteHostStringArray(array, {"a", "", std::string("b\0c", 3)});
    EXPECT_EQ(ReadHostStringArray(array),
              (std::vector<std::string>{"a", "", std::string("b\0c", 3)}));
    Release(array);
    // Arrays made by the host with null elements or a bad count are handled safely.
    // Two elements that were never given strings.
    HostStringArray nulls = DSNewHClr(8 + 16);
    const int32_t two = 2;
    std::memcpy(*nulls, &two, sizeof two);
    EXPECT_EQ(ReadHostStringArray(nulls), (std::vector<std::string>{"", ""}));
    WriteHostStringArrayElement(nulls, 1, "filled");
    EXPECT_EQ(ReadHostStringArrayElement(nulls, 1), "filled");
    EXPECT_NO_THROW(ResizeHostStringArray(nulls, 0));
    DSDisposeHandle(nulls);

    // A negative stored count: nothing to keep, and nothing written before the first element.
    HostStringArray negative = DSNewHClr(8);
    const int32_t minusFive = -5;
    std::memcpy(*negative, &minusFive, sizeof minusFive);
    EXPECT_EQ(HostStringArrayCount(negative), 0);
    ResizeHostStringArray(negative, 2);
    EXPECT_EQ(ReadHostStringArray(negative), (std::vector<std::string>{"", ""}));
    Release(negative);
}

TEST(HostString, WriteAllocatesGrowsAndReadsBackEveryByteUnknownHandlesRaise) {
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
    EXPECT_EQ(ReadHostString(nullptr), "");
    text = DSNewHClr(8);
    const int32_t negative = -3;
    std::memcpy(*text, &negative, sizeof negative);
    EXPECT_EQ(ReadHostString(text), "");
    DSDisposeHandle(text);
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
