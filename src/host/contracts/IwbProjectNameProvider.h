// Implemented by a project provider that supplies names to the host's name controls: the host
// asks it which name categories it serves, which names a control may take, and hands it the
// control's configuration and selection events.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"
#include "host/binding/runtime_api.h"

#include <cstdint>

// Status codes a name provider leaves in its callers' status out-parameters.
enum : int32_t {
    kNameControlOK = 0,
    kNameControlNotHandled = 4, // the event is not one the provider handles
    kNameControlNoTarget = 5,   // the target behind the application offers no I/O resources
    kNameControlNoMemory = 6,   // the host ran out of memory while the list was filled
};

// A selection event of a name control: its kind (1 = a name was selected), the control's data
// and where the provider leaves its status.
struct WbNameControlEvent {
    int32_t kind;
    WBVariant data;
    int32_t* status;
};

// The name list a provider fills: a host handle of a 32-bit element count, 4 bytes of padding,
// then one 8-byte host variant slot per element. Each element carries the string attribute "n"
// (the name shown) and, on an entry that names nothing to choose, the 32-bit attribute "f" = 1.
struct IwbProjectNameProvider : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("FEC40346-35DB-4BA6-8B3A-EF826AA431AB");

    // The categories the provider serves: COUNT BSTRs in a CoTaskMemAlloc array.
    virtual HRESULT ListCategories(uint32_t* count, BSTR** categories) = 0;
    // The names a control with DATA may take on the target behind APPREF, in a new name list in
    // *NAMELIST (the slot is overwritten; what it held stays the caller's). COUNT and NAMES are
    // cleared; STATUS receives one of the codes above.
    virtual HRESULT ListNames(WBRefNum appRef, WBVariant data, uint32_t* count, BSTR** names,
                              WBHandle* nameList, int32_t* status) = 0;
    virtual HRESULT Reserved3() = 0;
    virtual HRESULT Reserved4() = 0;
    // One entry in a new name list in *NAMELIST that tells whether the target behind APPREF
    // offers I/O resources ("f" = 1 when it does not).
    virtual HRESULT CheckTarget(WBRefNum appRef, WBHandle* nameList, int32_t* status) = 0;
    // Runs the control's configuration dialog on VALUE (a host reference to the control's
    // data); *STATUS is set to 1.
    virtual HRESULT Configure(uint64_t value, int32_t* status) = 0;
    // Mode 1: whether the target behind APPREF offers I/O resources (status 0 or 5). Mode 2:
    // compares the I/O interfaces of INPUT's "userData1" and "userData2" and writes the answer
    // (0 match, 1 not satisfied, 2 tolerated difference) as "result" on OUTPUT. Other modes
    // answer 0 at once.
    virtual HRESULT Query(uint32_t mode, WBRefNum appRef, WBVariant input, WBVariant output,
                          int32_t* status) = 0;
    // A selection event; see WbNameControlEvent.
    virtual HRESULT OnSelect(WbNameControlEvent* event) = 0;
    virtual HRESULT Reserved9() = 0;
};
