// The host program runner.
#include "runner/HostProgramRunner.h"

#include "com/CallGuard.h"
#include "kern/Utf8.h"
#include "runner/Behaviours.h"
#include "runner/HostProgram.h"
#include "runtime/RefnumTable.h"

#include <limits>

namespace wbhost::runner {

namespace {
// HRESULT_FROM_WIN32(ERROR_FILE_NOT_FOUND): the status a missing file gives on the host.
constexpr HRESULT kFileNotFound = static_cast<HRESULT>(0x80070002);
} // namespace

HostProgramRunnerImpl::HostProgramRunnerImpl(std::shared_ptr<ProgramSession> session,
                                             ProjectItemFinder finder)
    : session_(std::move(session)), finder_(std::move(finder)) {}

HRESULT HostProgramRunnerImpl::MakeHostReference(IUnknown* object, uint64_t* reference) {
    if (!reference) {
        return E_POINTER;
    }
    *reference = 0;
    if (!object) {
        return E_POINTER;
    }
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Reference);
        FAILED(injected)) {
        return injected;
    }
    return qv::com::GuardCall([&] {
        const WBRefNum refnum = wbhost::runtime::RefnumTable::Instance().Add(object);
        if (refnum == 0) {
            return E_OUTOFMEMORY;
        }
        session_->Ledger().ReferenceMade(refnum);
        *reference = refnum;
        return S_OK;
    });
}

HRESULT HostProgramRunnerImpl::ReleaseHostReference(uint64_t reference) {
    // Only numbers this runner could have made are refnums; anything wider is unknown.
    if (reference == 0 || reference > std::numeric_limits<WBRefNum>::max()) {
        return S_FALSE;
    }
    return qv::com::GuardCall([&] {
        const bool known =
            wbhost::runtime::RefnumTable::Instance().Remove(static_cast<WBRefNum>(reference));
        session_->Ledger().ReferenceReleased(reference);
        return known ? S_OK : S_FALSE;
    });
}

HRESULT HostProgramRunnerImpl::FindProjectItem(const GUID& id, IwbProjectItem** item) {
    if (!item) {
        return E_POINTER;
    }
    *item = nullptr;
    if (!finder_) {
        return S_FALSE;
    }
    return qv::com::GuardCall([&] { return finder_(id, item); });
}

HRESULT HostProgramRunnerImpl::OpenProgram(const char16_t* path, IwbProgram** program) {
    if (!program) {
        return E_POINTER;
    }
    *program = nullptr;
    if (!path) {
        return E_POINTER;
    }
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Open); FAILED(injected)) {
        return injected;
    }
    return qv::com::GuardCall([&] {
        const std::string file = qv::kern::WideToUtf8(path);
        bool missing = false;
        auto parsed = LoadProgramFile(file, &missing);
        if (missing) {
            return kFileNotFound;
        }
        if (!parsed || !IsKnownBehaviour(parsed->behaviour)) {
            return E_FAIL;
        }
        HostProgram* made = nullptr;
        const HRESULT hr = HostProgram::CreateInstance(&made, session_, file, std::move(*parsed));
        *program = made;
        return hr;
    });
}

HRESULT HostProgramRunnerImpl::LoadIcon(const char16_t* name, uint64_t* icon) {
    if (!icon) {
        return E_POINTER;
    }
    *icon = 0;
    if (!name) {
        return E_POINTER;
    }
    return qv::com::GuardCall([&] {
        *icon = session_->RecordIcon(name);
        return S_OK;
    });
}

} // namespace wbhost::runner
