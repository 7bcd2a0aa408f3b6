// The shared connection list. The lock is held for lookups and insertions only, never while a
// library loads or an engine opens or closes a connection.
#include "host/binding/ConnectionList.h"

namespace qv::host::rt {

ConnectionList::Entry* ConnectionList::FindLocked(const std::string& version, int kind) {
    for (Entry& entry : entries_) {
        if (entry.kind == kind && entry.version == version) {
            return &entry;
        }
    }
    return nullptr;
}

EngineConnection* ConnectionList::Acquire(const std::string& version, int kind,
                                          const Opener& open) {
    {
        const std::lock_guard guard(lock_);
        if (Entry* entry = FindLocked(version, kind)) {
            ++entry->uses;
            return entry->connection.get();
        }
    }
    std::unique_ptr<EngineConnection> fresh = open ? open() : nullptr;
    if (!fresh) {
        return nullptr;
    }
    std::unique_ptr<EngineConnection> discarded;
    const std::lock_guard guard(lock_);
    if (Entry* entry = FindLocked(version, kind)) {
        ++entry->uses;
        discarded = std::move(fresh); // closed after the lock is released
        return entry->connection.get();
    }
    // Keyed by the full version text: names too long to be kept by the connection must still not
    // share one entry.
    entries_.push_back(Entry{version, kind, std::move(fresh), 1});
    return entries_.back().connection.get();
}

void ConnectionList::Release(EngineConnection* connection) {
    std::unique_ptr<EngineConnection> closing;
    {
        const std::lock_guard guard(lock_);
        for (auto it = entries_.begin(); it != entries_.end(); ++it) {
            if (it->connection.get() != connection) {
                continue;
            }
            if (--it->uses == 0) {
                closing = std::move(it->connection);
                entries_.erase(it);
            }
            break;
        }
    }
}

int ConnectionList::UseCount(const EngineConnection* connection) const {
    const std::lock_guard guard(lock_);
    for (const Entry& entry : entries_) {
        if (entry.connection.get() == connection) {
            return entry.uses;
        }
    }
    return 0;
}

ConnectionList& ConnectionList::Shared() {
    static ConnectionList list;
    return list;
}

} // namespace qv::host::rt
