// The entry names of one resource tree, each spelling held once with its order key.
#pragma once

#include "kern/StringBase.h"
#include "resource_tree/TreeArena.h"

#include <cstdint>
#include <deque>
#include <memory>
#include <string_view>
#include <vector>

namespace wbhw {

// A description repeats a few dozen entry names tens of thousands of times. Held by each entry,
// every name longer than the string's inline buffer was a heap block of its own: made by the
// load, read by lookups and the comparison walk, freed by the teardown. The store keeps one copy
// per spelling (case and all) for the life of its tree; entries count their uses, and spellings
// no entry uses any more are dropped and their places reused once they are as many as the rest,
// so a tree edited for a long time keeps at most about twice the spellings it uses. Under the
// address sanitizer every entry has a name of its own, freed with it, so that a name read
// through a removed entry is still caught. One thread uses a tree, and so its store, at a time.
class NameStore {
public:
    struct Name {
        qv::kern::WString spelling;
        uint64_t key = 0;   // qv::kern::NameOrderKey(spelling)
        uint32_t uses = 0;  // entries holding this name
        bool alone = false; // made for one entry, and freed with it
    };

    // SHARED false gives every entry a name of its own (what the address sanitizer wants).
    explicit NameStore(bool shared = !WBT_TREE_ARENA_BYPASS) noexcept : shared_(shared) {}
    NameStore(const NameStore&) = delete;
    NameStore& operator=(const NameStore&) = delete;

    // The name spelled exactly SPELLING, made when there is none. Its uses are counted by the
    // entry that takes it (AddUse), before anything else is asked of the store.
    Name& Intern(std::u16string_view spelling);
    // One more use of NAME (of this store).
    static void AddUse(Name& name) noexcept { ++name.uses; }
    // One use of NAME less; a name without uses may be dropped by a later Intern.
    static void Release(Name& name) noexcept;
    // How many names the store holds, unused ones not yet dropped included. For tests.
    size_t size() const noexcept { return names_.size() - free_.size(); }

private:
    Name* Find(std::u16string_view spelling) const noexcept;
    void Index(Name* name);
    void Regrow(size_t slots);
    // Drops the names no entry uses: their places wait for new spellings.
    void Sweep();

    std::deque<Name> names_; // places never move while the store lives
    std::vector<Name*> free_;
    std::vector<Name*> slots_; // open-addressed, a power of two in size, at most half used
    size_t indexed_ = 0;
    size_t sweepAt_ = kFirstSweep;
    bool shared_;
    static constexpr size_t kFirstSweep = 1024;
};

} // namespace wbhw
