// Text helpers shared by the attribute-bag and cluster-XML forms.
#include "attribute_bag/XmlText.h"

#include "kern/Utf8.h"
#include "resource_tree/XmlEscape.h"

namespace wbhw {
namespace {

// True for a UTF-16 unit that XML 1.0 forbids everywhere, even as a character reference.
bool IsForbiddenInXml(char16_t c) noexcept {
    if (c < 0x20)
        return c != u'\t' && c != u'\n' && c != u'\r';
    return c == 0xFFFE || c == 0xFFFF;
}

} // namespace

void AppendEscapedText(std::u16string_view text, std::u16string& out) {
    for (const char16_t c : text)
        AppendXmlEscaped(c, false, out);
}

void AppendEscapedAttribute(std::u16string_view text, std::u16string& out) {
    for (const char16_t c : text)
        AppendXmlEscaped(c, true, out);
}

std::string ToXmlUtf8Lenient(std::u16string_view wide) {
    std::u16string cleaned;
    for (size_t i = 0; i < wide.size(); ++i) {
        if (!IsForbiddenInXml(wide[i]))
            continue;
        // Rare: copy once, then patch every forbidden unit.
        cleaned.assign(wide);
        for (size_t j = i; j < cleaned.size(); ++j) {
            if (IsForbiddenInXml(cleaned[j]))
                cleaned[j] = u'?';
        }
        wide = cleaned;
        break;
    }
    return qv::kern::WideToStandardUtf8(wide, u'?');
}

bool ToUtf8Strict(std::u16string_view wide, std::string& out) {
    if (qv::kern::HasLoneSurrogate(wide))
        return false;
    out = qv::kern::WideToStandardUtf8(wide);
    return true;
}

} // namespace wbhw
