// Helpers shared by the resource-tree tests: loading documents, scratch directories.
#pragma once

#include "resource_tree/ResTreeNode.h"
#include "support/ScratchFolder.h"

#include <memory>
#include <string>
#include <vector>

namespace wbhw::test {

// A fresh untyped, unordered root, as the loader's callers make them.
inline std::unique_ptr<ResTreeNode> NewRoot() {
    return std::make_unique<ResTreeNode>(WString(), WString(), false);
}

// Loads TEXT into a fresh root; RESULT receives the status.
inline std::unique_ptr<ResTreeNode> Load(std::u16string_view text,
                                         const LoaderSettings* settings = nullptr,
                                         int32_t* result = nullptr) {
    auto root = NewRoot();
    const int32_t status = root->ParseText(text, false, nullptr, settings);
    if (result != nullptr)
        *result = status;
    return root;
}

// The names of NODE's entries in container order.
inline std::vector<std::u16string> Names(const ResTreeNode& node) {
    std::vector<std::u16string> names;
    for (ResTreePosition at = node.Begin(); at != node.End(); ++at)
        names.push_back(at->Name());
    return names;
}

// The text of entry NAME in NODE, or "<absent>".
inline std::u16string TextOf(ResTreeNode& node, std::u16string_view name) {
    const ResTreePosition at = node.Find(name);
    if (at == node.End() || at->Text() == nullptr)
        return u"<absent>";
    return *at->Text();
}

// The child node NAME of NODE, or null.
inline ResTreeNode* ChildOf(ResTreeNode& node, std::u16string_view name) {
    const ResTreePosition at = node.Find(name);
    return at == node.End() ? nullptr : at->Child();
}

using ScratchDirectory = ::test::ScratchFolder;

} // namespace wbhw::test
