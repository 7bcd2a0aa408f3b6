// Finding a node below another by a relative path, and how much of the path led somewhere.
#pragma once

#include "resource_tree/ResTreeNode.h"

#include <cstdint>
#include <string_view>

namespace wbhost::resources {

struct NodeLookup {
    // The node the path names; null when the walk falls off the tree.
    wbhw::ResTreeNode* node = nullptr;
    // Characters of the path, from its start, up to the end of the last piece that named a node
    // (the whole length when the node was found).
    uint32_t matched = 0;
    // The node that those characters name: NODE when it was found, else the last node the walk
    // reached (the start node when no piece named one). Never null.
    wbhw::ResTreeNode* deepest = nullptr;
};

// Walks PATH from FROM: pieces are separated by "/" ("\/" and "\\" stand for a "/" and a
// backslash inside a name), "." stays and ".." goes up, a leading "/" starts at the root, and a
// piece names a child or follows a link. An empty path names FROM itself.
NodeLookup FindDescendant(wbhw::ResTreeNode& from, std::u16string_view path);

} // namespace wbhost::resources
