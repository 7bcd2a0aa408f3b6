// TargetItemFromAppRef and ControlOnlineHelp.
#include "runtime/HostObjects.h"

#include "runtime/Runtime.h"

#include <mutex>
#include <new>

namespace wbhost::runtime {

namespace {

struct HostObjects {
    std::mutex lock;
    TargetItemResolver resolver;
    std::vector<HelpRequest> help;
};

HostObjects& State() {
    static HostObjects state;
    return state;
}

} // namespace

void SetTargetItemResolver(TargetItemResolver resolver) {
    const std::lock_guard hold(State().lock);
    State().resolver = std::move(resolver);
}

std::vector<HelpRequest> HelpRequests() {
    const std::lock_guard hold(State().lock);
    return State().help;
}

void ClearHelpRequests() {
    const std::lock_guard hold(State().lock);
    State().help.clear();
}

} // namespace wbhost::runtime

using wbhost::runtime::State;

WBErr TargetItemFromAppRef(WBRefNum appRef, void** item) {
    if (item == nullptr) {
        return kWBArgErr;
    }
    *item = nullptr;
    try {
        wbhost::runtime::TargetItemResolver resolver;
        {
            const std::lock_guard hold(State().lock);
            resolver = State().resolver;
        }
        // Called outside the lock: the project may call back into the runtime.
        if (!resolver) {
            return kWBGenericErr;
        }
        const WBErr err = resolver(appRef, item);
        if (err != kWBNoErr) {
            *item = nullptr;
        }
        return err;
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    } catch (...) {
        return kWBGenericErr;
    }
}

WBErr ControlOnlineHelp(int32_t command, const char* helpFile, const char* topic) {
    try {
        const std::lock_guard hold(State().lock);
        State().help.push_back({command, helpFile ? helpFile : "", topic ? topic : ""});
        return kWBNoErr;
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}
