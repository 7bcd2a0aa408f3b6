// Version names: the shortened form tried after the full text, and which names are kept.
#include "host/binding/VersionName.h"

#include <gtest/gtest.h>

using qv::host::rt::ShortVersionName;
using qv::host::rt::StoredVersionName;

TEST(VersionName, ReleaseSuffixesShortenToMajorMinorAndLongNamesAreNotKept) {
    EXPECT_EQ(ShortVersionName("16.0.0f1"), "16.0");
    EXPECT_EQ(ShortVersionName("8.6b3"), "8.6");
    EXPECT_EQ(ShortVersionName("2020.1.3"), "2020.1");
    // Texts without a shortening point have none.
    EXPECT_EQ(ShortVersionName(""), std::nullopt);
    EXPECT_EQ(ShortVersionName("16.0"), std::nullopt);
    EXPECT_EQ(ShortVersionName("8.2f"), std::nullopt) << "the suffix digit must be in the text";
    EXPECT_EQ(ShortVersionName("8.2x1"), std::nullopt);
    EXPECT_EQ(ShortVersionName("1234567890.1.2"), std::nullopt) << "the point lies past the scan";
    EXPECT_EQ(StoredVersionName("12345678901"), "12345678901");
    EXPECT_EQ(StoredVersionName("123456789012"), "");
}
