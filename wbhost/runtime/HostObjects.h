// What the runtime's host-object functions reach: the project's target items, which the holder
// of a project provides, and the online help, whose requests this host records.
#pragma once

#include "host/binding/runtime_api.h"

#include <functional>
#include <string>
#include <vector>

namespace wbhost::runtime {

// Finds the target item behind an application reference: kWBNoErr and the item (a COM
// interface pointer with a reference) in *item, or an error and null.
using TargetItemResolver = std::function<WBErr(WBRefNum appRef, void** item)>;

// Lets the holder of a project answer TargetItemFromAppRef (an empty RESOLVER: no project, every
// question is answered kWBGenericErr).
void SetTargetItemResolver(TargetItemResolver resolver);

// One request of ControlOnlineHelp.
struct HelpRequest {
    int32_t command;
    std::string helpFile; // empty when none was given
    std::string topic;    // empty when none was given
    bool operator==(const HelpRequest&) const = default;
};

// The help requests so far, oldest first.
std::vector<HelpRequest> HelpRequests();
// Forgets the recorded help requests.
void ClearHelpRequests();

} // namespace wbhost::runtime
