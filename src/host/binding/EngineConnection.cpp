// Connections to run-time engines. A connection that fails to open keeps nothing loaded.
#include "host/binding/EngineConnection.h"

#include "host/binding/RuntimeLoader.h"
#include "host/binding/VersionName.h"

#include <utility>

namespace qv::host::rt {

namespace {

using kern::osdep::DynamicModule;

constexpr int32_t kConnectionMode = 2;

const void* const* FunctionTableOf(void* library) {
    void* entry = kern::osdep::ModuleExport(library, "GetCInterfaceFunctionTable");
    if (entry == nullptr) {
        entry = kern::osdep::ModuleExport(library, "GetCIntGXServerFuncs");
    }
    if (entry == nullptr) {
        return nullptr;
    }
    return reinterpret_cast<GetCInterfaceFunctionTableFn*>(entry)();
}

std::unique_ptr<EngineConnection> TryOpen(int kind, const std::string& version,
                                          DynamicModule library, const std::string& application) {
    if (!library) {
        return nullptr;
    }
    auto connection = std::make_unique<EngineConnection>(version, kind);
    if (!connection->Open(std::move(library), application)) {
        return nullptr;
    }
    return connection;
}

} // namespace

EngineConnection::EngineConnection(const std::string& versionName, int kind)
    : versionName_(StoredVersionName(versionName)), kind_(kind) {}

EngineConnection::~EngineConnection() {
    Close();
}

bool EngineConnection::Open(DynamicModule library, const std::string& application) {
    Close();
    library_ = std::move(library);
    if (library_ && OpenTable(application)) {
        return true;
    }
    functions_.reset();
    handle_ = nullptr;
    library_.Reset();
    return false;
}

bool EngineConnection::OpenTable(const std::string& application) {
    functions_ = WrapFunctionTable(FunctionTableOf(library_.handle()));
    if (!functions_) {
        return false;
    }
    int32_t status = -1;
    if (application.empty()) {
        if (WBCIntOpenFn* open = functions_->Open()) {
            status = open(&handle_, kConnectionMode, 0);
        }
    } else if (WBCIntOpenByNameFn* openByName = functions_->OpenByName()) {
        status = openByName(&handle_, kConnectionMode, 0, application.c_str());
    }
    WBCIntStartFn* const start = functions_->Start();
    if (status != 0 || start == nullptr) {
        return false;
    }
    start(handle_);
    open_ = true;
    return true;
}

void EngineConnection::Close() noexcept {
    if (open_) {
        // Engines of kinds 0 and 1 want the thread's pending window messages dispatched first;
        // there is no window message queue here, so closing goes straight to the engine.
        if (WBCIntCloseFn* close = functions_->Close()) {
            close(handle_);
        }
        open_ = false;
    }
    handle_ = nullptr;
    functions_.reset();
    library_.Reset();
}

std::unique_ptr<EngineConnection> OpenEngineConnection(int kind, const std::string& version,
                                                       const std::string& application,
                                                       const EngineSearchEnvironment& environment) {
    if (auto connection =
            TryOpen(kind, version, LoadRuntime(kind, version, {}, environment), application)) {
        return connection;
    }
    if (kind != kProcessRuntime) {
        const auto shortName = ShortVersionName(version);
        if (!shortName || *shortName == version) {
            return nullptr;
        }
        return TryOpen(kind, *shortName, LoadRuntime(kind, *shortName, {}, environment),
                       application);
    }
    for (const char* library : {kRunTimeEngineLibrary, kFFRunTimeEngineLibrary}) {
        if (auto connection = TryOpen(kind, version, DynamicModule(library), application)) {
            return connection;
        }
    }
    return nullptr;
}

} // namespace qv::host::rt
