// Marks an item object as a name scope: names of I/O items below it are unique only there, and
// enumerations do not descend below it.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItemScope : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("12F25D6D-970E-4D52-AEC9-DB77752609B9");
};
