// Deferred notifications of hardware items: the host collects notification names while it is
// busy and hands them over later; property dispatch runs through the item's method dispatcher.
#pragma once

#include "com/IUnknown.h"

struct IwbHWDeferredMethodDispatcher : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("3C6B9E12-8D4F-47A1-B25E-6A7C8D9E0F11");

    // Runs the property and method work the item deferred.
    virtual HRESULT DispatchDeferredMethods() = 0;
};

struct IwbHWDeferredNotifications : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("7A2D4C61-5E3B-4F08-9C17-2B8E6D4A3F52");

    // Handles COUNT notification NAMES in order; the first failure is answered, else the status
    // of the last call. Names the item does not know are skipped.
    virtual HRESULT DispatchNotifications(uint32_t count, const char16_t* const* names) = 0;
};
