// The way back from the UTF-8 form of documents handed to Expat.
#include "resource_tree/LoaderText.h"

#include "kern/Utf8.h"

#include <gtest/gtest.h>
#include <string>

namespace wbhw {
namespace {

TEST(LoaderText, WellFormedTextsComeBackFromUtf8Unchanged) {
    std::u16string text = u"prefix ";
    text += std::u16string(100, u'a') + u"\u00E9\U0001F600 tail";
    EXPECT_EQ(FromUtf8Lenient(qv::kern::WideToStandardUtf8(text)), text);
    // Undecodable bytes become U+FFFD, and what was decoded before them stays.
    EXPECT_EQ(FromUtf8Lenient("ok\xFF"), u"ok\uFFFD");
}

} // namespace
} // namespace wbhw
