// BSTR allocation, per-thread initialisation counts and GUID text.
#include "com/Bstr.h"

#include "com/ComGuid.h"
#include "com/ComInit.h"

#include <gtest/gtest.h>
#include <thread>

namespace {

TEST(Bstr, KeepsLengthEmbeddedZerosAndTerminatorNullAndEmptyAreDistinct) {
    const std::u16string text(u"a\0b\u00e9", 4);
    qv::com::UniqueBstr b(qv::com::AllocBstr(text));
    ASSERT_TRUE(b);
    EXPECT_EQ(SysStringLen(b.get()), 4u);
    EXPECT_EQ(SysStringByteLen(b.get()), 8u);
    EXPECT_EQ(b.get()[4], u'\0');
    EXPECT_EQ(qv::com::BstrToString(b.get()), text);
    EXPECT_EQ(SysAllocString(nullptr), nullptr);
    EXPECT_EQ(SysStringLen(nullptr), 0u);
    EXPECT_EQ(qv::com::BstrToString(nullptr), u"");
    SysFreeString(nullptr);
    qv::com::UniqueBstr empty(qv::com::AllocBstr(u""));
    ASSERT_TRUE(empty); // an empty text is a real allocation, not a failure
    EXPECT_EQ(SysStringLen(empty.get()), 0u);
    qv::com::UniqueBstr zeros(SysAllocStringLen(nullptr, 3));
    EXPECT_EQ(qv::com::BstrToString(zeros.get()), std::u16string(3, u'\0'));
    qv::com::UniqueBstr copy(SysAllocString(u"Tangent IO"));
    EXPECT_EQ(qv::com::BstrToString(copy.get()), u"Tangent IO");
    EXPECT_EQ(SysAllocStringLen(u"x", 0xFFFFFFFFu), nullptr); // the byte length cannot fit
}

TEST(ComInit, CountsPerThreadAndIgnoresUnbalancedUninitialize) {
    CoUninitialize(); // nothing to undo
    EXPECT_EQ(CoInitialize(nullptr), S_OK);
    EXPECT_EQ(CoInitialize(nullptr), S_FALSE);
    std::thread other([] {
        EXPECT_EQ(qv::com::CoInitializeCount(), 0u);
        EXPECT_EQ(CoInitialize(nullptr), S_OK);
        CoUninitialize();
    });
    other.join();
    EXPECT_EQ(qv::com::CoInitializeCount(), 2u);
    CoUninitialize();
    CoUninitialize();
    CoUninitialize();
    EXPECT_EQ(qv::com::CoInitializeCount(), 0u);
    EXPECT_EQ(CoInitialize(nullptr), S_OK);
    CoUninitialize();
}

TEST(ComGuid, ParsesTextFormsAndOrdersFieldByField) {
    constexpr GUID a = qv::com::ParseGuid("{8DF12EF0-9B63-4346-99D9-34B3172FFFBA}");
    constexpr GUID b = qv::com::ParseGuid("8fc35a9f-c4b7-4cf9-a2ba-6fc5c6e55647");
    static_assert(a.Data1 == 0x8DF12EF0u && a.Data2 == 0x9B63 && a.Data3 == 0x4346);
    static_assert(a.Data4[0] == 0x99 && a.Data4[7] == 0xBA);
    static_assert(b.Data4[2] == 0x6F);
    const qv::com::GuidLess less;
    EXPECT_TRUE(less(a, b));
    EXPECT_FALSE(less(b, a));
    EXPECT_FALSE(less(a, a));
    GUID c = a;
    c.Data4[7] = 0xBB;
    EXPECT_TRUE(less(a, c));
    EXPECT_FALSE(IsEqualGUID(a, c));
    EXPECT_TRUE(IsEqualGUID(GUID_NULL, GUID{}));
    // The first field compares as an unsigned number.
    EXPECT_TRUE(less(qv::com::ParseGuid("7FFFFFFF-0000-0000-0000-000000000000"),
                     qv::com::ParseGuid("80000000-0000-0000-0000-000000000000")));
}

} // namespace
