// List texts and resource paths: backslash escaping, splitting at a separator, relative paths.
#include "resource_tree/ListText.h"

#include "kern/Collate.h"

namespace wbhw {

std::u16string_view TrimBlanks(std::u16string_view text) noexcept {
    const size_t first = text.find_first_not_of(kBlankChars);
    if (first == std::u16string_view::npos)
        return {};
    const size_t last = text.find_last_not_of(kBlankChars);
    return text.substr(first, last - first + 1);
}

std::u16string EscapeListText(std::u16string_view text, char16_t separator) {
    std::u16string out;
    out.reserve(text.size());
    for (const char16_t c : text) {
        if (c == u'\\' || c == separator)
            out.push_back(u'\\');
        out.push_back(c);
    }
    return out;
}

std::u16string UnescapeListText(std::u16string_view text, char16_t separator) {
    std::u16string out;
    out.reserve(text.size());
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == u'\\' && i + 1 < text.size() &&
            (text[i + 1] == u'\\' || text[i + 1] == separator))
            ++i;
        out.push_back(text[i]);
    }
    return out;
}

std::vector<std::u16string> SplitListText(std::u16string_view text, char16_t separator, bool trim) {
    std::vector<std::u16string> pieces;
    if (text.empty())
        return pieces;
    size_t start = 0;
    size_t backslashes = 0;
    auto emit = [&](size_t end) {
        std::u16string piece = UnescapeListText(text.substr(start, end - start), separator);
        if (trim)
            piece = std::u16string(TrimBlanks(piece));
        pieces.push_back(std::move(piece));
    };
    for (size_t i = 0; i < text.size(); ++i) {
        const char16_t c = text[i];
        if (c == separator && backslashes % 2 == 0) {
            emit(i);
            start = i + 1;
        }
        backslashes = (c == u'\\') ? backslashes + 1 : 0;
    }
    emit(text.size());
    return pieces;
}

std::u16string JoinListText(const std::vector<std::u16string>& pieces, char16_t separator) {
    std::u16string out;
    for (size_t i = 0; i < pieces.size(); ++i) {
        if (i != 0)
            out.push_back(separator);
        for (const char16_t c : pieces[i]) {
            if (c == separator)
                out.push_back(u'\\');
            out.push_back(c);
        }
    }
    return out;
}

std::vector<std::u16string> AbsolutePathPieces(std::u16string_view path) {
    // The root's path "/" has no names; without this the root would count as one empty name and
    // every path computed from it would climb one level too far.
    if (!path.empty() && path.front() == u'/')
        path.remove_prefix(1);
    return SplitListText(path, u'/', false);
}

std::u16string RelativeResourcePath(std::u16string_view base, std::u16string_view target) {
    const std::vector<std::u16string> from = AbsolutePathPieces(base);
    const std::vector<std::u16string> to = AbsolutePathPieces(target);
    size_t common = 0;
    while (common < from.size() && common < to.size() &&
           qv::kern::EqualsNoCase(from[common], to[common]))
        ++common;
    std::u16string out;
    auto append = [&out](std::u16string_view piece) {
        if (!out.empty())
            out.push_back(u'/');
        out += piece;
    };
    for (size_t i = common; i < from.size(); ++i)
        append(u"..");
    for (size_t i = common; i < to.size(); ++i)
        append(EscapeListText(to[i], u'/'));
    return out;
}

std::u16string JoinResourcePath(std::u16string_view base, std::u16string_view rest) {
    std::u16string out(base);
    if (out != u"/")
        out.push_back(u'/');
    out += rest;
    return out;
}

} // namespace wbhw
