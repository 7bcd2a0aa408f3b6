// Escaping of text for the XML that the module writes (resource trees, attribute bags, clusters).
#pragma once

#include <string>

namespace wbhw {

// Appends C to OUT as XML text content, or, with ATTRIBUTE, as part of a double-quoted attribute
// value. "&", "<", ">" always become entities and a carriage return "&#13;" (a reader would turn
// it into a line feed); inside attributes '"' becomes "&quot;" and tab and line feed become
// character references, since a reader would otherwise turn them into spaces.
inline void AppendXmlEscaped(char16_t c, bool attribute, std::u16string& out) {
    switch (c) {
    case u'&':
        out += u"&amp;";
        return;
    case u'<':
        out += u"&lt;";
        return;
    case u'>':
        out += u"&gt;";
        return;
    case u'\r':
        out += u"&#13;";
        return;
    default:
        break;
    }
    if (attribute) {
        switch (c) {
        case u'"':
            out += u"&quot;";
            return;
        case u'\t':
            out += u"&#9;";
            return;
        case u'\n':
            out += u"&#10;";
            return;
        default:
            break;
        }
    }
    out += c;
}

} // namespace wbhw
