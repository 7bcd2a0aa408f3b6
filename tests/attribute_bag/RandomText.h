// Random texts that exercise the XML forms: markup characters, quotes, blanks, line ends and
// characters beyond ASCII and beyond the basic plane.
#pragma once

#include <random>
#include <string>

namespace test {

// A text of up to MAXLENGTH pieces, each an ordinary letter or one of the awkward characters.
inline std::u16string RandomXmlText(std::mt19937& random, int maxLength) {
    static const std::u16string pieces[] = {
        u"a",      u"B",      u"z",      u"0",          u" ",      u"\t",     u"\n",    u"\r",
        u"&",      u"<",      u">",      u"\"",         u"'",      u"/",      u"&amp;", u"]]>",
        u"\u00E9", u"\u00C9", u"\u65E5", u"\U0001F600", u"\u0130", u"\u00DF",
    };
    std::uniform_int_distribution<int> length(0, maxLength);
    std::uniform_int_distribution<size_t> pick(0, std::size(pieces) - 1);
    std::u16string text;
    for (int n = length(random); n > 0; --n)
        text += pieces[pick(random)];
    return text;
}

} // namespace test
