// The value classes behind the reference interfaces: a shared engine connection, the host
// error the reference holds, and for programs the handle and terminals.
#pragma once

#include "host/binding/EngineConnection.h"
#include "host/refs/ProgramCalls.h"
#include "host/refs/TerminalValue.h"

#include <cstdint>
#include <string>

namespace qv::host::refs {

// A reference to a run-time engine connection. Construction acquires the shared connection for
// (version name, kind); a connection that cannot be opened leaves a host error in the object.
class WBRef {
public:
    WBRef(std::string versionName, int kind, int openMode);
    virtual ~WBRef();
    WBRef(const WBRef&) = delete;
    WBRef& operator=(const WBRef&) = delete;

    // Whether the connection is open and its function table usable.
    bool IsValid() const;
    // The host error the reference holds (0 = none); later operations answer it again.
    int32_t hostError() const { return hostError_; }
    const std::string& versionName() const { return versionName_; }
    int kind() const { return kind_; }
    int openMode() const { return openMode_; }

protected:
    const rt::WBCIntFunctions* functions() const;
    void* connectionHandle() const;
    void SetHostError(int32_t error) { hostError_ = error; }

private:
    std::string versionName_;
    int kind_;
    int openMode_;
    rt::EngineConnection* connection_ = nullptr;
    int32_t hostError_ = 0;
};

// An application reference.
class AppRef : public WBRef {
public:
    using WBRef::WBRef;
    // Whether programs may run over tables older than the free-run revision.
    bool AllowsOldTables() const { return false; }
};

// A program reference opened over an application's connection.
class GXRef : public WBRef {
public:
    // Opens PATH over APP's connection and, when FORRUNNING, prepares it; a failing step leaves
    // its host error in the object.
    GXRef(const AppRef& app, const std::string& path, uint32_t options, uint32_t flags,
          bool forRunning);
    ~GXRef() override;

    // Host error codes of the operations (0 = none); see I_GXRef.
    int32_t SetControlValue(int32_t index, double value);
    int32_t Run(int32_t wait);
    int32_t GetControlValue(int32_t index, void** data, const uint8_t** type) const;

    bool prepared() const { return prepared_; }

private:
    const WBTerminal* Terminal(int32_t index) const;
    NumericClass ClassOf(const WBTerminal& terminal) const;
    template <class Fn> Fn* Call(size_t slot) const;

    void* program_ = nullptr;
    WBTerminal* terminals_ = nullptr;
    int32_t terminalCount_ = 0;
    bool prepared_ = false;
    bool allowOldTables_ = false;
};

} // namespace qv::host::refs
