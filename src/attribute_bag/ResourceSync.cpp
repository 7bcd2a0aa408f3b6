// Attribute definitions of resources.
#include "attribute_bag/ResourceSync.h"

#include "host/StatusError.h"
#include "kern/Collate.h"

using qv::host::ResourceNode;
using qv::kern::EqualsNoCase;

namespace {

constexpr std::u16string_view kResource = u"resource";

// Removes from SET's chain every attribute other than "resource" that DEFINED does not show,
// then adds DEFINED's attributes that SET does not show yet.
void ApplyDefinitions(TIOAttrBag& set, const TIOAttrBag& defined) {
    std::vector<std::u16string> stale;
    for (const TIOAttrBag::Entry& entry : set.VisibleAttributes())
        if (!EqualsNoCase(*entry.name, kResource) && !defined.FindVisible(*entry.name))
            stale.push_back(*entry.name);
    for (const std::u16string& name : stale) {
        // Removed where it is defined, which may be an ancestor of SET.
        for (TIOAttrBag* at = &set; at != nullptr; at = at->Parent())
            if (at->RemoveAttribute(name))
                break;
    }
    for (const TIOAttrBag::Entry& entry : defined.VisibleAttributes())
        set.AddIfAbsent(*entry.name, *entry.value);
}

} // namespace

void CopyFromResourceNode(const ResourceNode& definitions, TIOAttrBag*& current) {
    TIOAttrBag* const start = current;
    for (const ResourceNode& child : definitions.Children()) {
        const std::u16string type = child.ElementType();
        if (EqualsNoCase(type, u"AttributeSet")) {
            // Each level holds one nested set: a second one would have to start from a set
            // the first already left.
            if (current != start)
                QV_THROW(qv::host::StatusError(E_FAIL));
            current = &start->GetOrCreateChild(child.Name());
            CopyFromResourceNode(child, current);
        } else if (EqualsNoCase(type, u"Attribute")) {
            start->AddIfAbsent(child.Name(), child.Attribute(u"Value").value_or(u""));
        }
    }
}

HRESULT SyncFromResource(ItemResourceContext& context, TIOAttrBag& set, bool dropDefinitions,
                         ResourceNode* resourceNode) {
    const ResourceNode& root = context.Root();
    if (!root)
        return E_FAIL;
    TIOAttrBag scratch;
    TIOAttrBag* defined = &scratch.GetOrCreateChild(root.Name());
    if (!dropDefinitions) {
        const std::u16string path = set.GetValue(kResource);
        if (path.empty())
            return S_FALSE;
        ResourceNode node = root.Find(path);
        if (!node)
            return S_FALSE;
        if (resourceNode != nullptr)
            *resourceNode = node;
        if (const ResourceNode definitions = node.Find(u"AttributeSet")) {
            TIOAttrBag* current = defined;
            CopyFromResourceNode(definitions, current);
            defined = EqualsNoCase(current->Name(), u"Node") && current->Parent() != nullptr
                          ? current->Parent()
                          : current;
        }
    }
    ApplyDefinitions(set, *defined);
    return S_OK;
}
