// Runs of the module's own programs.
#include "items/TIOProgramCall.h"

#include "com/Bstr.h"
#include "com/TaskMem.h"
#include "framework/IqxProvider.h"
#include "framework/IqxProviderSite.h"
#include "host/StatusError.h"
#include "kern/Path.h"
#include "kern/Utf8.h"
#include "kern/osdep/Path.h"

using qv::com::ComPtr;
using qv::host::CheckStatus;
using qv::host::StatusError;

namespace tio {

std::u16string ProgramPath(std::u16string_view file) {
    std::string folder;
    try {
        folder = qv::kern::osdep::GetModuleDirectoryOf(reinterpret_cast<const void*>(&ProgramPath));
    } catch (const qv::kern::exception::Exception&) {
        // No path is built, so nothing of an unknown folder is ever run.
        QV_THROW(StatusError(E_FAIL));
    }
    const std::string path =
        qv::kern::JoinPath(qv::kern::JoinPath(folder, "wbtio/private"), qv::kern::WideToUtf8(file));
    return qv::kern::Utf8ToWide(path);
}

ComPtr<IUnknown> ProviderRoot(IqxProvider* provider) {
    const auto site = provider != nullptr ? qv::com::QueryAs<IqxProviderSite>(provider)
                                          : ComPtr<IqxProviderSite>();
    if (!site)
        QV_THROW(StatusError(E_UNEXPECTED));
    ComPtr<IUnknown> root;
    CheckStatus(site->GetSite(root.Put()));
    return root;
}

ProgramCall::ProgramCall(IUnknown* root, std::u16string_view file) {
    const std::u16string path = ProgramPath(file);
    IwbProgram* program = nullptr;
    IwbProgramRunner* runner = nullptr;
    const HRESULT opened = qv::host::runner::OpenHostProgram(root, path, &program, &runner);
    runner_ = ComPtr<IwbProgramRunner>::Adopt(runner);
    program_ = ComPtr<IwbProgram>::Adopt(program);
    CheckStatus(opened);
    if (!program_)
        QV_THROW(StatusError(E_FAIL));
}

// The references go back to the runner before the program and the runner are let go.
ProgramCall::~ProgramCall() {
    references_.clear();
}

void ProgramCall::SetReference(uint32_t index, IUnknown* object) {
    auto reference = std::make_unique<qv::host::runner::RunnerReference>(runner_.Get(), object);
    CheckStatus(reference->status());
    const uint64_t value = reference->value();
    references_.push_back(std::move(reference));
    CheckStatus(program_->SetInputReference(index, value));
}

void ProgramCall::SetString(uint32_t index, std::u16string_view text) {
    const std::u16string held(text);
    CheckStatus(program_->SetInputString(index, held.c_str()));
}

void ProgramCall::SetStrings(uint32_t index, const std::vector<std::u16string>& texts) {
    std::vector<const char16_t*> array;
    array.reserve(texts.size());
    for (const std::u16string& text : texts)
        array.push_back(text.c_str());
    CheckStatus(program_->SetInputStringArray(index, array.empty() ? nullptr : array.data(),
                                              static_cast<uint32_t>(array.size())));
}

void ProgramCall::SetInt32(uint32_t index, int32_t value) {
    CheckStatus(program_->SetInputInt32(index, value));
}

void ProgramCall::Run() {
    CheckStatus(program_->Run());
}

int32_t ProgramCall::Int32(uint32_t index) {
    int32_t value = 0;
    CheckStatus(program_->GetOutputInt32(index, &value));
    return value;
}

std::u16string ProgramCall::String(uint32_t index) {
    BSTR value = nullptr;
    const HRESULT hr = program_->GetOutputString(index, &value);
    const qv::com::UniqueBstr held(value);
    CheckStatus(hr);
    return qv::com::BstrToString(value);
}

std::vector<std::u16string> ProgramCall::Strings(uint32_t index) {
    BSTR* array = nullptr;
    uint32_t count = 0;
    const HRESULT hr = program_->GetOutputStringList(index, &array, &count);
    std::vector<std::u16string> texts;
    // Every text is freed, whether or not the read succeeded or the copy runs out of memory.
    struct Release {
        BSTR* array;
        uint32_t count;
        ~Release() {
            for (uint32_t i = 0; array != nullptr && i < count; ++i)
                SysFreeString(array[i]);
            CoTaskMemFree(array);
        }
    } const release{array, count};
    CheckStatus(hr);
    texts.reserve(count);
    for (uint32_t i = 0; i < count; ++i)
        texts.push_back(qv::com::BstrToString(array[i]));
    return texts;
}

} // namespace tio
