// The list of names a name control offers, filled in a host array of variants: a 32-bit count,
// 4 bytes of padding, then one 8-byte variant slot per element, each with the string attribute
// "n" and, on an entry that names nothing to choose, "f" = 1.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstdint>
#include <string_view>

namespace tio {

class NameList {
public:
    // Makes a new zero-filled list for CAPACITY elements in *SLOT, with no element yet. STATUS
    // receives 6 when the host has no memory for it; every later step is then skipped.
    NameList(WBHandle* slot, uint32_t capacity, int32_t* status);

    // Appends NAME (wide; the host's code page in the list), flagged when PLACEHOLDER. Nothing
    // happens once the status is not 0, or when the list is full. A host string that cannot be
    // had sets status 6 and appends nothing; an attribute the host does not take sets status 6
    // and the element still counts. Answers false for a NAME that does not fit the 255 bytes of
    // a name, which is left out.
    bool Append(std::u16string_view name, bool placeholder);

    uint32_t Count() const noexcept { return count_; }

private:
    bool Usable() const noexcept { return *status_ == 0 && handle_ != nullptr; }
    void StoreCount();

    WBHandle handle_ = nullptr;
    uint32_t capacity_ = 0;
    uint32_t count_ = 0;
    int32_t* status_;
};

} // namespace tio
