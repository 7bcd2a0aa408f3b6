// One copy of each entry name of a tree, found by its exact spelling.
#include "resource_tree/NameStore.h"

#include "kern/Collate.h"
#include "resource_tree/SpellingTable.h"

#include <algorithm>

namespace wbhw {

NameStore::Name& NameStore::Intern(std::u16string_view spelling) {
    if (!shared_) {
        // The entry owns this name alone; Release frees it with the entry.
        auto own = std::make_unique<Name>(
            Name{qv::kern::WString(spelling), qv::kern::NameOrderKey(spelling), 0, true});
        return *own.release();
    }
    if (Name* known = Find(spelling))
        return *known;
    if (indexed_ + 1 >= sweepAt_)
        Sweep();
    Name* made = nullptr;
    if (!free_.empty()) {
        made = free_.back();
        free_.pop_back();
        made->spelling.assign(spelling);
        made->key = qv::kern::NameOrderKey(spelling);
        made->uses = 0;
    } else {
        made = &names_.emplace_back(
            Name{qv::kern::WString(spelling), qv::kern::NameOrderKey(spelling), 0});
    }
    Index(made);
    return *made;
}

void NameStore::Release(Name& name) noexcept {
    if (--name.uses == 0 && name.alone)
        std::unique_ptr<Name> gone(&name);
}

NameStore::Name* NameStore::Find(std::u16string_view spelling) const noexcept {
    if (slots_.empty())
        return nullptr;
    const size_t mask = slots_.size() - 1;
    for (size_t i = HashSpelling(spelling) & mask;; i = (i + 1) & mask) {
        Name* const name = slots_[i];
        if (name == nullptr)
            return nullptr;
        if (SameSpelling(name->spelling, spelling))
            return name;
    }
}

void NameStore::Index(Name* name) {
    if (2 * (indexed_ + 1) > slots_.size())
        Regrow(slots_.empty() ? 64 : 2 * slots_.size());
    const size_t mask = slots_.size() - 1;
    size_t i = HashSpelling(name->spelling) & mask;
    while (slots_[i] != nullptr)
        i = (i + 1) & mask;
    slots_[i] = name;
    ++indexed_;
}

void NameStore::Regrow(size_t slots) {
    std::vector<Name*> old(slots, nullptr);
    old.swap(slots_);
    indexed_ = 0;
    for (Name* name : old) {
        if (name != nullptr)
            Index(name);
    }
}

void NameStore::Sweep() {
    std::vector<Name*> live;
    live.reserve(indexed_);
    for (Name* name : slots_) {
        if (name == nullptr)
            continue;
        if (name->uses != 0) {
            live.push_back(name);
            continue;
        }
        // Dropped names give their memory back; the place waits for the next new spelling.
        qv::kern::WString().swap(name->spelling);
        free_.push_back(name);
    }
    std::fill(slots_.begin(), slots_.end(), nullptr);
    indexed_ = 0;
    for (Name* name : live)
        Index(name);
    sweepAt_ = std::max(kFirstSweep, 2 * live.size());
}

} // namespace wbhw
