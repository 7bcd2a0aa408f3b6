// Creating Tangent I/O items from attribute-set texts: the routine behind the create-new wizard
// and the bulk-creation export.
#pragma once

#include "host/contracts/IwbProjectItem.h"

#include <cstddef>
#include <span>
#include <string>

namespace tio {

// The status of a creation whose name is taken where it would go: by an item of the same name
// below the same folder, or, for a folder part of the name, by an item that is no folder.
inline constexpr HRESULT kNameTaken = static_cast<HRESULT>(0x800700B7);

// What a creation request works on: the item below which new items (and the folders their names
// ask for) are created, and one attribute-set text per item.
struct CreationContext {
    IwbProjectItem* parent = nullptr;
    std::span<const std::u16string> texts;
};

// Creates the item that text INDEX of CONTEXT describes. The text is read as an attribute bag
// (E_FAIL when it does not read); its "name" is the item's place, folders first, separated by
// "/" (a "/" after an odd number of backslashes belongs to the name; E_INVALIDARG for an absent
// name or an empty part). Folders are reused or made below the parent; the item is made below
// the innermost with the bag, binds to its "resource" and is hidden when that resource says
// "HiddenTIO". E_FAIL for an index past the texts; the host's failures as they come.
HRESULT CreateItemFromText(const CreationContext& context, size_t index);

// Creates one item per text of CONTEXT in order and stops at the first failure, which it
// answers; the items made before it stay. The change handling of CHANGEOWNER (the object of the
// target the items belong to; may be null) is suspended meanwhile and its previous setting put
// back on every path, so a failing creation never leaves the target suspended.
HRESULT CreateItemsFromTexts(const CreationContext& context, IUnknown* changeOwner);

} // namespace tio
