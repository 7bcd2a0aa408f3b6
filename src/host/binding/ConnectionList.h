// The connections to run-time engines, shared by every reference to the same (version, kind).
#pragma once

#include "host/binding/EngineConnection.h"

#include <functional>
#include <list>
#include <memory>
#include <mutex>
#include <string>

namespace qv::host::rt {

class ConnectionList {
public:
    // Makes a new open connection, or null when opening fails.
    using Opener = std::function<std::unique_ptr<EngineConnection>()>;

    // The shared connection for (`version`, `kind`) with its use count raised; when there is none
    // yet, `open` makes one (outside the lock, since it may load a library). When another thread
    // added the same pair meanwhile, the new connection is closed and the existing one is used.
    // Null when `open` fails; nothing is then counted.
    EngineConnection* Acquire(const std::string& version, int kind, const Opener& open);
    // Lowers the use count of a connection from Acquire; at zero it is unlinked and closed.
    // Connections that are not in the list are ignored.
    void Release(EngineConnection* connection);
    // The use count of a connection, 0 when it is not in the list.
    int UseCount(const EngineConnection* connection) const;

    // The list shared by the whole module.
    static ConnectionList& Shared();

private:
    struct Entry {
        std::string version;
        int kind;
        std::unique_ptr<EngineConnection> connection;
        int uses;
    };

    Entry* FindLocked(const std::string& version, int kind);

    mutable std::mutex lock_;
    std::list<Entry> entries_;
};

} // namespace qv::host::rt
