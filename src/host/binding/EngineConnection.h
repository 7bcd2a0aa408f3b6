// A connection to a run-time engine (or host process) through its C-interface function table.
#pragma once

#include "host/binding/EngineSearch.h"
#include "host/binding/RuntimeLoader.h"
#include "host/binding/WBCIntFunctions.h"
#include "kern/osdep/DynamicModule.h"

#include <memory>
#include <string>

namespace qv::host::rt {

class EngineConnection {
public:
    // A closed connection for `versionName` (kept only when shorter than twelve characters) and
    // `kind`.
    EngineConnection(const std::string& versionName, int kind);
    EngineConnection(const EngineConnection&) = delete;
    EngineConnection& operator=(const EngineConnection&) = delete;
    // Closes the connection if it is open.
    ~EngineConnection();

    // Takes `library`, opens its function table and a connection, to the application named
    // `application` when it is not empty, and starts it. False when any step fails; the connection
    // then forgets the table and releases the library.
    bool Open(kern::osdep::DynamicModule library, const std::string& application);
    // Closes an open connection and releases the library; does nothing when closed.
    void Close() noexcept;

    bool IsOpen() const noexcept { return open_; }
    // The engine's connection handle, null when closed.
    void* handle() const noexcept { return handle_; }
    // The function table of an open connection, null when closed.
    const WBCIntFunctions* functions() const noexcept { return functions_.get(); }
    // The library the connection uses, null when closed.
    void* library() const noexcept { return library_.handle(); }
    const std::string& versionName() const noexcept { return versionName_; }
    int kind() const noexcept { return kind_; }

private:
    bool OpenTable(const std::string& application);

    std::string versionName_;
    int kind_;
    kern::osdep::DynamicModule library_;
    std::unique_ptr<WBCIntFunctions> functions_;
    void* handle_ = nullptr;
    bool open_ = false;
};

// Loads the runtime for (`kind`, `version`) and opens a connection to `application` (empty: the
// default). When the full version fails its shortened form is tried; for kind 2 a failure is
// retried with "libwbrt.so", then "libwbffrt.so". Null when every attempt fails.
std::unique_ptr<EngineConnection> OpenEngineConnection(int kind, const std::string& version,
                                                       const std::string& application,
                                                       const EngineSearchEnvironment& environment);

} // namespace qv::host::rt
