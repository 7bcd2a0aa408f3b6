// Finding a node below another by a relative path.
#include "resources/NodeLookup.h"

#include "resource_tree/ListText.h"

#include <limits>

namespace wbhost::resources {
namespace {

// Where the piece starting at BEGIN ends: at the next "/" that no backslash escapes.
size_t PieceEnd(std::u16string_view path, size_t begin) {
    for (size_t i = begin; i < path.size(); ++i) {
        if (path[i] == u'\\') {
            ++i; // the escaped character, whatever it is, belongs to the piece
        } else if (path[i] == u'/') {
            return i;
        }
    }
    return path.size();
}

uint32_t Count(size_t characters) {
    return characters > std::numeric_limits<uint32_t>::max() ? std::numeric_limits<uint32_t>::max()
                                                             : static_cast<uint32_t>(characters);
}

} // namespace

NodeLookup FindDescendant(wbhw::ResTreeNode& from, std::u16string_view path) {
    wbhw::ResTreeNode* current = &from;
    size_t matched = 0;
    size_t at = 0;
    if (!path.empty() && path.front() == u'/') {
        current = &from.Root();
        matched = at = 1;
    }
    while (at < path.size()) {
        const size_t end = PieceEnd(path, at);
        const std::u16string piece = wbhw::UnescapeListText(path.substr(at, end - at), u'/');
        wbhw::ResTreeNode* next = nullptr;
        if (piece.empty() || piece == u".")
            next = current; // "a//b" and "a/./b" name the same node as "a/b"
        else if (piece == u"..")
            next = current->Parent();
        else
            next = current->NodeAt(current->FindLoading(piece));
        if (next == nullptr)
            return {nullptr, Count(matched), current};
        current = next;
        matched = end;
        at = end + 1;
    }
    return {current, Count(path.size()), current};
}

} // namespace wbhost::resources
