// Value classes of host references over the engine's function table.
#include "host/refs/WBRef.h"

#include "host/binding/ConnectionList.h"
#include "host/binding/runtime_api.h"

namespace qv::host::refs {

WBRef::WBRef(std::string versionName, int kind, int openMode)
    : versionName_(std::move(versionName)), kind_(kind), openMode_(openMode) {
    connection_ = rt::ConnectionList::Shared().Acquire(versionName_, kind_, [this] {
        return rt::OpenEngineConnection(kind_, versionName_, {},
                                        rt::EngineSearchEnvironment::FromProcess());
    });
    if (!connection_) {
        hostError_ = kWBGenericErr;
    }
}

WBRef::~WBRef() {
    if (connection_) {
        rt::ConnectionList::Shared().Release(connection_);
    }
}

bool WBRef::IsValid() const {
    return connection_ && connection_->IsOpen() && connection_->functions() &&
           connection_->functions()->IsValid();
}

const rt::WBCIntFunctions* WBRef::functions() const {
    return connection_ ? connection_->functions() : nullptr;
}

void* WBRef::connectionHandle() const {
    return connection_ ? connection_->handle() : nullptr;
}

template <class Fn> Fn* GXRef::Call(size_t slot) const {
    return IsValid() ? functions()->Function<Fn>(slot) : nullptr;
}

GXRef::GXRef(const AppRef& app, const std::string& path, uint32_t options, uint32_t flags,
             bool forRunning)
    : WBRef(app.versionName(), app.kind(), app.openMode()), allowOldTables_(app.AllowsOldTables()) {
    if (hostError() != 0) {
        return;
    }
    auto* open = Call<WBCIntOpenProgramFn>(kOpenProgramSlot);
    if (!open) {
        SetHostError(kWBNotSupported);
        return;
    }
    if (const int32_t error = open(connectionHandle(), path.c_str(), options, flags, &program_)) {
        program_ = nullptr;
        SetHostError(error);
        return;
    }
    if (!forRunning) {
        return;
    }
    auto* prepare = Call<WBCIntPrepareProgramFn>(kPrepareProgramSlot);
    if (!prepare) {
        SetHostError(kWBNotSupported);
        return;
    }
    if (const int32_t error = prepare(program_, &terminalCount_, &terminals_)) {
        SetHostError(error);
        return;
    }
    prepared_ = terminalCount_ >= 0 && (terminals_ || terminalCount_ == 0);
}

GXRef::~GXRef() {
    if (program_) {
        if (auto* close = Call<WBCIntCloseProgramFn>(kCloseProgramSlot)) {
            close(program_);
        }
    }
}

const WBTerminal* GXRef::Terminal(int32_t index) const {
    if (!prepared_ || index < 0 || index >= terminalCount_) {
        return nullptr;
    }
    return &terminals_[index];
}

NumericClass GXRef::ClassOf(const WBTerminal& terminal) const {
    if (!terminal.type) {
        return NumericClass::kNone;
    }
    if (functions()->Revision() >= kNumericClassRevision) {
        if (auto* classOf = Call<WBCIntNumericClassFn>(kNumericClassSlot)) {
            const int32_t cls = classOf(terminal.type);
            return cls >= 0 && cls <= 15 ? static_cast<NumericClass>(cls) : NumericClass::kNone;
        }
    }
    return NumericClassOfTypeCode(terminal.type[1]);
}

int32_t GXRef::SetControlValue(int32_t index, double value) {
    const WBTerminal* terminal = Terminal(index);
    if (!terminal || !StoreTerminalValue(ClassOf(*terminal), value, terminal->data)) {
        return kWBArgErr;
    }
    return kWBNoErr;
}

int32_t GXRef::Run(int32_t wait) {
    if (!prepared_) {
        return kWBArgErr;
    }
    if (functions()->Revision() < kFreeRunRevision && !allowOldTables_) {
        return kWBNotSupported;
    }
    auto* run = Call<WBCIntRunProgramFn>(kRunProgramSlot);
    if (!run) {
        return kWBNotSupported;
    }
    SetHostError(run(program_, wait));
    return hostError();
}

int32_t GXRef::GetControlValue(int32_t index, void** data, const uint8_t** type) const {
    const WBTerminal* terminal = Terminal(index);
    if (!terminal) {
        return kWBArgErr;
    }
    *data = terminal->data;
    *type = terminal->type;
    return kWBNoErr;
}

} // namespace qv::host::refs
