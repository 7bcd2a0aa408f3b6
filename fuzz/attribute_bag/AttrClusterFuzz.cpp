// The cluster-XML reader on arbitrary texts: a text it accepts gives a name and value that
// write out and parse back unchanged; the input also serves as a name and value to round-trip.
#include "FuzzText.h"
#include "attribute_bag/WBAttrClusterParser.h"

#include <cstdlib>

namespace {

bool HasCharacterXmlCannotCarry(std::u16string_view text) {
    for (size_t i = 0; i < text.size(); ++i) {
        const char16_t c = text[i];
        if ((c < 0x20 && c != u'\t' && c != u'\n' && c != u'\r') || c == 0xFFFE || c == 0xFFFF)
            return true;
    }
    return false;
}

void ExpectRoundTrip(std::u16string_view name, std::u16string_view value) {
    std::u16string backName;
    std::u16string backValue;
    if (wbhw::ParseAttrCluster(wbhw::WriteAttrCluster(name, value), backName, backValue) != 0 ||
        backName != name || backValue != value)
        std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::u16string text = fuzz::WideFromBytes(data, size);
    std::u16string name;
    std::u16string value;
    if (wbhw::ParseAttrCluster(text, name, value) == 0)
        ExpectRoundTrip(name, value);
    if (!HasCharacterXmlCannotCarry(text)) {
        const std::u16string_view whole(text);
        size_t half = whole.size() / 2;
        // Never cut a surrogate pair: a lone half is rightly refused.
        if (half > 0 && whole[half - 1] >= 0xD800 && whole[half - 1] <= 0xDBFF)
            --half;
        ExpectRoundTrip(whole.substr(0, half), whole.substr(half));
    }
    return 0;
}
