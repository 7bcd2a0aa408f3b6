// The root of every interface: query, add reference and release, in that slot order.
#pragma once

#include "com/ComGuid.h"
#include "com/HResult.h"

#include <cstdint>

// Every interface derives from this one, directly or through an earlier version of itself.
// An interface that extends another names it as BaseInterface so that queries for the older
// identifier are answered by the newer interface.
struct IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("00000000-0000-0000-C000-000000000046");

    // Answers the interface IID of this object with a reference in *object; E_NOINTERFACE (and
    // null) when the object does not offer it, E_POINTER when object is null.
    virtual HRESULT QueryInterface(const IID& iid, void** object) = 0;
    // Adds a reference; answers the new count (for diagnostics only).
    virtual uint32_t AddRef() = 0;
    // Drops a reference; the object deletes itself at zero. Answers the new count.
    virtual uint32_t Release() = 0;

protected:
    // Objects are destroyed only through Release.
    ~IUnknown() = default;
};

static_assert(sizeof(IUnknown) == sizeof(void*), "an interface is one table pointer, no data");
