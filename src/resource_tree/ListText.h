// List texts and resource paths: backslash escaping, splitting at a separator, relative paths.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace wbhw {

// The characters that trimming removes from both ends of a list piece or a text.
inline constexpr std::u16string_view kBlankChars = u" \t\r\n";

// TEXT without leading and trailing blanks (" \t\r\n"); empty for a text of only blanks.
std::u16string_view TrimBlanks(std::u16string_view text) noexcept;

// Puts a backslash before every backslash and every SEPARATOR character in TEXT.
std::u16string EscapeListText(std::u16string_view text, char16_t separator);

// Removes a backslash that precedes a backslash or SEPARATOR; other backslashes stay.
std::u16string UnescapeListText(std::u16string_view text, char16_t separator);

// Cuts TEXT at every SEPARATOR preceded by an even number of backslashes, unescapes each piece and
// optionally trims it. An empty text gives no pieces; "a," gives "a" and an empty piece.
std::vector<std::u16string> SplitListText(std::u16string_view text, char16_t separator, bool trim);

// Joins PIECES with SEPARATOR, escaping the separator (only) inside each piece.
std::u16string JoinListText(const std::vector<std::u16string>& pieces, char16_t separator);

// The names along an absolute resource path ("/a/b" gives a, b; "/" gives none), unescaped.
std::vector<std::u16string> AbsolutePathPieces(std::u16string_view path);

// The path that leads from the node at absolute path BASE to the node at absolute path TARGET:
// ".." for every name of BASE below the common part, then the rest of TARGET's names, escaped
// and joined with "/". Equal paths give the empty path (the node itself).
std::u16string RelativeResourcePath(std::u16string_view base, std::u16string_view target);

// A child path below BASE: BASE + "/" + REST, without doubling the root's "/".
std::u16string JoinResourcePath(std::u16string_view base, std::u16string_view rest);

} // namespace wbhw
