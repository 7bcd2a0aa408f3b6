// What the provider does for the host's I/O name controls: the names that fit a control, the
// check of a target, the comparison of two controls' interfaces and the control's programs.
#pragma once

#include "host/contracts/IwbProjectNameProvider.h"

#include <cstdint>

namespace tio::namecontrol {

// The one category served, "FPGA IO".
HRESULT ListCategories(uint32_t* count, BSTR** categories);
HRESULT ListNames(WBRefNum appRef, WBVariant data, uint32_t* count, BSTR** names,
                  WBHandle* nameList, int32_t* status);
HRESULT CheckTarget(WBRefNum appRef, WBHandle* nameList, int32_t* status);
// Configure and OnSelect run their programs through the runner of ROOT (the framework's root).
HRESULT Configure(IUnknown* root, uint64_t value, int32_t* status);
HRESULT Query(uint32_t mode, WBRefNum appRef, WBVariant input, WBVariant output, int32_t* status);
HRESULT OnSelect(IUnknown* root, WbNameControlEvent* event);

} // namespace tio::namecontrol
