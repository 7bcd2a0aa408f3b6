// The host program object: inputs, a run through the session's behaviour, outputs.
#include "runner/HostProgram.h"

#include "com/CallGuard.h"
#include "com/TaskMem.h"
#include "runner/Behaviours.h"

namespace wbhost::runner {

HostProgramImpl::HostProgramImpl(std::shared_ptr<ProgramSession> session, std::string path,
                                 ProgramFile file)
    : session_(std::move(session)), path_(std::move(path)), file_(std::move(file)) {}

HRESULT HostProgramImpl::SetInput(uint32_t index, ProgramValue value) {
    if (index >= kTerminalCount) {
        return E_INVALIDARG;
    }
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Input);
        FAILED(injected)) {
        return injected;
    }
    const std::lock_guard hold(lock_);
    inputs_[index] = std::move(value);
    return S_OK;
}

const ProgramValue* HostProgramImpl::Output(uint32_t index) const {
    if (!outputs_) {
        return nullptr;
    }
    const auto found = outputs_->find(index);
    return found == outputs_->end() ? nullptr : &found->second;
}

HRESULT HostProgramImpl::SetInputReference(uint32_t index, uint64_t value) {
    return qv::com::GuardCall([&] { return SetInput(index, HostReference{value}); });
}

HRESULT HostProgramImpl::SetInputInt32(uint32_t index, int32_t value) {
    return qv::com::GuardCall([&] { return SetInput(index, value); });
}

HRESULT HostProgramImpl::SetInputString(uint32_t index, const char16_t* value) {
    return qv::com::GuardCall([&] { return SetInput(index, std::u16string(value ? value : u"")); });
}

HRESULT HostProgramImpl::SetInputStringArray(uint32_t index, const char16_t* const* array,
                                             uint32_t count) {
    if (!array && count != 0) {
        return E_POINTER;
    }
    return qv::com::GuardCall([&] {
        std::vector<std::u16string> texts;
        texts.reserve(count);
        for (uint32_t i = 0; i < count; ++i) {
            texts.emplace_back(array[i] ? array[i] : u"");
        }
        return SetInput(index, std::move(texts));
    });
}

HRESULT HostProgramImpl::Run() {
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Run); FAILED(injected)) {
        return injected;
    }
    return qv::com::GuardCall([&] {
        const std::lock_guard hold(lock_);
        auto outputs =
            RunBehaviour(file_.behaviour, inputs_, session_->AnswersFor(file_.behaviour));
        if (!outputs) {
            return E_FAIL;
        }
        session_->Record({path_, file_.behaviour, inputs_, *outputs});
        outputs_ = std::move(outputs);
        return S_OK;
    });
}

HRESULT HostProgramImpl::GetOutputInt32(uint32_t index, int32_t* value) {
    if (!value) {
        return E_POINTER;
    }
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Output);
        FAILED(injected)) {
        return injected;
    }
    const std::lock_guard hold(lock_);
    const ProgramValue* output = Output(index);
    const int32_t* number = output ? std::get_if<int32_t>(output) : nullptr;
    if (!number) {
        return E_INVALIDARG;
    }
    *value = *number;
    return S_OK;
}

HRESULT HostProgramImpl::GetOutputStatus(uint32_t index, int32_t* status) {
    return GetOutputInt32(index, status);
}

HRESULT HostProgramImpl::GetOutputString(uint32_t index, BSTR* value) {
    if (!value) {
        return E_POINTER;
    }
    *value = nullptr;
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Output);
        FAILED(injected)) {
        return injected;
    }
    return qv::com::GuardCall([&] {
        const std::lock_guard hold(lock_);
        const ProgramValue* output = Output(index);
        const std::u16string* text = output ? std::get_if<std::u16string>(output) : nullptr;
        if (!text) {
            return E_INVALIDARG;
        }
        *value = qv::com::AllocBstr(*text);
        return *value || text->empty() ? S_OK : E_OUTOFMEMORY;
    });
}

HRESULT HostProgramImpl::GetOutputStringList(uint32_t index, BSTR** array, uint32_t* count) {
    if (!array || !count) {
        return E_POINTER;
    }
    *array = nullptr;
    *count = 0;
    if (const HRESULT injected = session_->Ledger().FailureAt(RunnerStep::Output);
        FAILED(injected)) {
        return injected;
    }
    return qv::com::GuardCall([&] {
        const std::lock_guard hold(lock_);
        const ProgramValue* output = Output(index);
        const auto* texts = output ? std::get_if<std::vector<std::u16string>>(output) : nullptr;
        if (!texts) {
            return E_INVALIDARG;
        }
        if (texts->empty()) {
            return S_OK;
        }
        auto* list = static_cast<BSTR*>(CoTaskMemAlloc(texts->size() * sizeof(BSTR)));
        if (!list) {
            return E_OUTOFMEMORY;
        }
        for (size_t i = 0; i < texts->size(); ++i) {
            list[i] = qv::com::AllocBstr((*texts)[i]);
            if (!list[i]) { // a list with a text missing would read as a shorter one
                for (size_t j = 0; j < i; ++j) {
                    SysFreeString(list[j]);
                }
                CoTaskMemFree(list);
                return E_OUTOFMEMORY;
            }
        }
        *array = list;
        *count = static_cast<uint32_t>(texts->size());
        return S_OK;
    });
}

} // namespace wbhost::runner
