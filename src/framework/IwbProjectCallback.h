// Deferred work a project item asked the host for: the host calls back later, with the item's
// callback bits telling what is due.
#pragma once

#include "com/IUnknown.h"

namespace wbproj::callback {
inline constexpr uint32_t kUpgradeVersion = 0x1; // the item's stored format is older
inline constexpr uint32_t kPendingWork = 0x2;    // the item has queued work to run
} // namespace wbproj::callback

struct IwbProjectCallback : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("9D8E4F3A-6B21-4C57-A0D8-1F2E3B4C5D6E");

    // The host's deferred call. Nothing happens for a null CALLBACK or when APPLIES is 0 (the
    // host withdrew the call); otherwise the due work runs and the last status is answered.
    virtual HRESULT OnProjectCallback(IUnknown* callback, int32_t applies) = 0;
    // The callback bits the item is waiting for (kUpgradeVersion, kPendingWork).
    virtual HRESULT GetPendingCallbacks(uint32_t* bits) = 0;
};
