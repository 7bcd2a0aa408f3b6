// The host's path objects: normalised '/' paths, recorded so that a stale or foreign pointer
// handed to a path function is answered with a host error instead of being followed.
#pragma once

#include "host/binding/runtime_api.h"

#include <memory>
#include <mutex>
#include <string>
#include <unordered_map>

struct WBPathRec {
    // '/'-separated, no repeated or trailing separators ("/" alone is the root); empty for the
    // empty path.
    std::string text;
};

namespace wbhost::runtime {

class PathTable {
public:
    // The table of this process.
    static PathTable& Instance();

    // A new path holding TEXT (normalised); null when out of memory.
    WBPath Create(std::string_view text);
    // Whether PATH is a live path of this table.
    bool IsLive(WBPath path) const;
    // Releases a live path; false for null or unknown paths.
    bool Destroy(WBPath path);
    // Stores TEXT (normalised) in the output slot *OUT: a null slot receives a new path, a live
    // one is reused. kWBArgErr for a null OUT or a slot holding anything else, kWBMemFullErr.
    WBErr Store(WBPath* out, std::string_view text);
    // The number of live paths (to find paths that were never released).
    size_t LiveCount() const;

private:
    mutable std::mutex lock_;
    std::unordered_map<WBPath, std::unique_ptr<WBPathRec>> paths_;
};

// TEXT with repeated and trailing separators removed.
std::string NormalisePath(std::string_view text);

} // namespace wbhost::runtime
