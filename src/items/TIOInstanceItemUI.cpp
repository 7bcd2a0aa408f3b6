// The Tangent I/O item.
#include "items/TIOInstanceItemUI.h"

#include "attribute_bag/TIOAttrBag.h"

TIOInstanceItemUI::TIOInstanceItemUI() = default;

// The working set points into the bag; the bag goes with the item.
TIOInstanceItemUI::~TIOInstanceItemUI() = default;
