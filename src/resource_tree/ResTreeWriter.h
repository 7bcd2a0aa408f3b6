// The canonical writer: a resource tree back as a resource-tree document.
#pragma once

#include "resource_tree/ResTreeNode.h"

#include <string>
#include <string_view>

namespace wbhw {

// A written document and whether loading it gives back an equal tree.
struct ResTreeDocument {
    std::u16string xml;
    // False when something cannot be written so that it loads back the same: a text entry whose
    // name is no element name (or is ":Link"/":Include"), characters that XML cannot carry, a text
    // that a loader variable would rewrite, a localized text that the language would pick
    // differently, or a link that does not lead to a node written before it. The document is
    // still complete; those entries are written as closely as XML allows.
    bool faithful = true;
};

// Writes NODE (as the document element) and its whole subtree. Names go in "name" attributes,
// the ordered flag only where it differs from the type's default, localized texts with their
// whole language list (checked against LANGUAGE; empty: the host's language). Entries keep their
// order. Loading the text into an untyped root gives a tree equal to NODE when FAITHFUL.
ResTreeDocument WriteResTree(const ResTreeNode& node, std::u16string_view language = {});

// True when A and B have equal names, types, ordered flags and entries in the same order (names,
// kinds and texts compared exactly, children recursively). DIFFERENCE, when given, receives the
// path and nature of the first difference found.
bool EqualResTrees(const ResTreeNode& a, const ResTreeNode& b,
                   std::u16string* difference = nullptr);

} // namespace wbhw
