// Text helpers shared by the attribute-bag and cluster-XML forms.
#include "attribute_bag/XmlText.h"

#include "resource_tree/XmlEscape.h"

#include <unicode/ustring.h>

namespace wbhw {
namespace {

// True for a UTF-16 unit that XML 1.0 forbids everywhere, even as a character reference.
bool IsForbiddenInXml(char16_t c) noexcept {
    if (c < 0x20)
        return c != u'\t' && c != u'\n' && c != u'\r';
    return c == 0xFFFE || c == 0xFFFF;
}

bool ConvertToUtf8(std::u16string_view wide, std::string& out, bool substitute) {
    out.clear();
    if (wide.empty())
        return true;
    // Three bytes per unit is the most UTF-8 ever needs for UTF-16 input.
    out.resize(wide.size() * 3);
    int32_t written = 0;
    UErrorCode status = U_ZERO_ERROR;
    const auto length = static_cast<int32_t>(wide.size());
    if (substitute) {
        u_strToUTF8WithSub(out.data(), static_cast<int32_t>(out.size()), &written, wide.data(),
                           length, u'?', nullptr, &status);
    } else {
        u_strToUTF8(out.data(), static_cast<int32_t>(out.size()), &written, wide.data(), length,
                    &status);
    }
    if (U_FAILURE(status))
        return false;
    out.resize(static_cast<size_t>(written));
    return true;
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
    std::string out;
    ConvertToUtf8(wide, out, true);
    return out;
}

bool ToUtf8Strict(std::u16string_view wide, std::string& out) {
    return ConvertToUtf8(wide, out, false);
}

} // namespace wbhw
