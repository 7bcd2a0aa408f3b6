// Paths of resource-tree nodes: the absolute path, resolving a path, the reserved nodes.
#include "kern/Collate.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ResTreeNode.h"

#include <algorithm>

namespace wbhw {

WString ResTreeNode::Path() const {
    std::vector<const ResTreeNode*> chain;
    for (const ResTreeNode* node = this; node->parent_ != nullptr; node = node->parent_)
        chain.push_back(node);
    if (chain.empty())
        return WString(u"/");
    WString path;
    for (auto it = chain.rbegin(); it != chain.rend(); ++it) {
        path.push_back(u'/');
        path += EscapeListText((*it)->Name(), u'/');
    }
    return path;
}

ResTreeNode* ResTreeNode::ResolvePath(std::u16string_view path, ResTreeNode* documentRoot) {
    ResTreeNode* current = this;
    std::u16string_view rest = path;
    if (path.substr(0, 2) == u"#{") {
        const size_t close = path.find(u'}', 2);
        // Without a closing brace there is no anchor; the text is walked as a relative path.
        if (close != std::u16string_view::npos) {
            const std::u16string_view anchor = path.substr(2, close - 2);
            if (documentRoot != nullptr && qv::kern::EqualsNoCase(anchor, u"document-root"))
                current = documentRoot;
            // The character after "}" is the separator; "#{document-root}" alone names the
            // anchor node itself.
            rest = close + 2 <= path.size() ? path.substr(close + 2) : std::u16string_view();
        }
    } else if (!path.empty() && path.front() == u'/') {
        current = &Root();
        rest = path.substr(1);
    }
    for (const std::u16string& piece : SplitListText(rest, u'/', false)) {
        if (current == nullptr)
            break;
        if (piece == u"..")
            current = current->parent_;
        else if (piece != u".")
            current = current->NodeAt(current->FindLoading(piece));
    }
    return current;
}

std::vector<ResTreeNode*> ResTreeNode::ReservedNodes(bool noLoad) {
    std::vector<ResTreeNode*> nodes;
    const Position found = noLoad ? Find(u"Reserves") : FindLoading(u"Reserves");
    if (found == End() || !IsTextKind(found->Kind()))
        return nodes;
    const WString list = found->text_;
    for (const std::u16string& piece : SplitListText(list, u',', true)) {
        if (ResTreeNode* node = ResolvePath(piece, nullptr))
            nodes.push_back(node);
    }
    return nodes;
}

} // namespace wbhw
