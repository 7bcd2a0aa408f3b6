// Loading arbitrary bytes as a resource-tree document (includes and deferred files resolved in a
// scratch directory), then walking the result: nothing may crash, leak or run away.
#include "FuzzSupport.h"
#include "resource_tree/ResTreeNode.h"
#include "resource_tree/ResTreeWriter.h"

#include <cstdint>
#include <cstdlib>
#include <vector>

namespace {

// Visits every node: paths resolve back, reservations and links resolve or give null.
void Walk(wbhw::ResTreeNode& node, int depth) {
    if (depth > 300)
        return;
    // Names repeated in ordered nodes resolve to their first namesake, so only run it.
    node.ResolvePath(node.Path());
    node.ReservedNodes(true);
    std::vector<wbhw::ResTreeNode*> children;
    for (wbhw::ResTreePosition at = node.Begin(); at != node.End(); ++at) {
        if (at->Kind() == wbhw::EntryKind::Child && at->Child() != nullptr)
            children.push_back(at->Child());
        else if (at->Kind() == wbhw::EntryKind::Link)
            node.NodeAt(at);
    }
    for (wbhw::ResTreeNode* child : children)
        Walk(*child, depth + 1);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::u16string text = wbhw::fuzz::DocumentFromBytes(data, size);
    const wbhw::LoaderSettings settings =
        wbhw::fuzz::FuzzSettings(wbhw::fuzz::WantsProductionLimits(data, size));
    wbhw::ResTreeNode root(wbhw::WString(), wbhw::WString(), false);
    wbhw::ResTreeNode* out = nullptr;
    const int32_t result = root.ParseText(text, (size & 2) != 0, &out, &settings);
    if (result == 0 && (size & 2) == 0 && out != &root)
        std::abort();
    if (result != 0 && out != nullptr)
        std::abort();
    if (wbhw::fuzz::CheckWithinBudget(root, settings) > wbhw::fuzz::kLargestWalkedTree)
        return 0;
    Walk(root, 0);
    wbhw::WriteResTree(root, u"deu");
    return 0;
}
