// The Expat adapter: events in wide strings, whole and split input, exceptions carried out, and
// the way back from the UTF-8 form of documents handed to Expat.
#include "resource_tree/ExPatHandler.h"

#include "kern/Utf8.h"
#include "resource_tree/LoaderText.h"

#include <gtest/gtest.h>
#include <stdexcept>
#include <string>

namespace {

// Records every event as one line of text.
class Recorder : public wbhw::ExPatHandler {
public:
    std::u16string log;
    bool throwOnStart = false;

    void StartElement(const std::u16string& name, const wbhw::XmlAttributes& atts) override {
        if (throwOnStart)
            throw std::runtime_error("handler failed");
        log += u"<" + name;
        for (const auto& [key, value] : atts)
            log += u" " + key + u"=" + value;
        log += u">";
    }
    void EndElement(const std::u16string& name) override { log += u"</" + name + u">"; }
    void CharacterData(std::u16string_view text) override { log += text; }
};

const std::string kDoc = "<a Name='x' b='\xC3\xA9'>t\xF0\x9F\x98\x80<c/></a>";
const std::u16string kExpected = u"<a b=\u00E9 Name=x>t\U0001F600<c></c></a>";

TEST(ExPatHandler, DeliversWideEventsWholeOrBytewiseDecodesLenientlyRethrowsAndReportsErrors) {
    Recorder whole;
    ASSERT_TRUE(whole.Parse(kDoc, true));
    EXPECT_EQ(whole.log, kExpected);

    Recorder bytewise;
    for (const char c : kDoc)
        ASSERT_TRUE(bytewise.Parse(std::string_view(&c, 1), false));
    ASSERT_TRUE(bytewise.Parse({}, true));
    EXPECT_EQ(bytewise.log, kExpected);
    Recorder throwing;
    throwing.throwOnStart = true;
    EXPECT_THROW(throwing.Parse("<a><b/></a>", true), std::runtime_error);
    Recorder r;
    EXPECT_FALSE(r.Parse("<a>\n  <b></a>", true));
    EXPECT_EQ(r.ErrorCode(), XML_ERROR_TAG_MISMATCH);
    EXPECT_EQ(r.CurrentLine(), 2u);
    EXPECT_EQ(r.CurrentColumn(), 7u);
    EXPECT_FALSE(r.ErrorString().empty());
    // Well-formed texts come back from UTF-8 unchanged.
    std::u16string text = u"prefix ";
    text += std::u16string(100, u'a') + u"\u00E9\U0001F600 tail";
    EXPECT_EQ(wbhw::FromUtf8Lenient(qv::kern::WideToStandardUtf8(text)), text);
    // Undecodable bytes become U+FFFD, and what was decoded before them stays.
    EXPECT_EQ(wbhw::FromUtf8Lenient("ok\xFF"), u"ok\uFFFD");
}

} // namespace
