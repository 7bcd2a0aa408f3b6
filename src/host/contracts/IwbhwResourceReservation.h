// Reservation queries on a node found through IwbhwResourceTreeAccess.
#pragma once

#include "com/IUnknown.h"

struct IwbhwResourceReservation : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("A0E48592-79B7-41C2-BA2A-7C1828EFE2D5");

    // Whether the node is reserved, for PROTOCOL (null: for any protocol); FLAG and the answer
    // in RESERVED are the service's.
    virtual HRESULT IsReserved(const char16_t* protocol, int32_t flag, uint32_t* reserved) = 0;
};
