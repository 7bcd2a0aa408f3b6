// Bringing an item's attribute set in line with the attribute definitions its resource carries
// in the target's resource tree.
#pragma once

#include "attribute_bag/ItemResourceContext.h"
#include "attribute_bag/TIOAttrBag.h"
#include "host/ResourceNode.h"

// Copies the definitions below DEFINITIONS (Attribute nodes with their "Value" defaults, nested
// AttributeSet nodes) into *CURRENT: attributes go into the set *CURRENT points at on entry, a
// nested AttributeSet moves *CURRENT to a child of that name, so on return it points at the
// deepest set made. A second AttributeSet sibling on one level is refused with E_FAIL (thrown as
// qv::host::StatusError), as are failing node queries.
void CopyFromResourceNode(const qv::host::ResourceNode& definitions, TIOAttrBag*& current);

// Makes SET's attributes those its resource defines: attributes the definitions do not have are
// removed ("resource" excepted), new ones arrive with their defaults, existing values stay. The
// resource is SET's visible "resource" path below CONTEXT's tree root. With DROPDEFINITIONS no
// definitions are read and every attribute but "resource" goes. Answers 0, or 1 when the path is
// empty or names no node (SET unchanged); RESOURCENODE (optional) receives the node found. A tree
// without root gives E_FAIL; failing host calls throw qv::host::StatusError.
HRESULT SyncFromResource(ItemResourceContext& context, TIOAttrBag& set, bool dropDefinitions,
                         qv::host::ResourceNode* resourceNode = nullptr);
