// Application and program reference objects. Allocation failures never leave these operations:
// they are answered as host error 2 with E_OUTOFMEMORY.
#include "host/refs/CAppRef.h"

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/binding/RuntimeLoader.h"
#include "host/binding/runtime_api.h"

#include <new>

namespace {

// Reports ERROR through the optional out-parameter; a non-zero error makes the call fail.
HRESULT Answer(int32_t* out, int32_t error) {
    if (out) {
        *out = error;
    }
    return error == kWBNoErr ? S_OK : E_UNEXPECTED;
}

// Reports an argument or memory failure with its status.
HRESULT Refuse(int32_t* out, int32_t error, HRESULT status) {
    if (out) {
        *out = error;
    }
    return status;
}

} // namespace

HRESULT OpenDefaultAppRef(I_AppRef** ref, int32_t* error) {
    if (!ref) {
        return Refuse(error, kWBArgErr, E_INVALIDARG);
    }
    *ref = nullptr;
    try {
        CQVComObject<CAppRef>* raw = nullptr;
        const HRESULT hr = CQVComObject<CAppRef>::CreateInstance(&raw, std::string(),
                                                                 qv::host::rt::kProcessRuntime, 0);
        if (hr == E_OUTOFMEMORY) {
            return Refuse(error, kWBMemFullErr, E_OUTOFMEMORY);
        }
        if (FAILED(hr)) {
            return Refuse(error, kWBGenericErr, hr);
        }
        const auto created = qv::com::ComPtr<CQVComObject<CAppRef>>::Adopt(raw);
        if (const int32_t hostError = raw->value().hostError()) {
            return Answer(error, hostError);
        }
        raw->QueryInterface(I_AppRef::iid, reinterpret_cast<void**>(ref));
        return Answer(error, *ref ? kWBNoErr : kWBGenericErr);
    } catch (const std::bad_alloc&) {
        return Refuse(error, kWBMemFullErr, E_OUTOFMEMORY);
    }
}

HRESULT CAppRef::OpenProgramRef(const char* path, uint32_t options, uint32_t flags,
                                int32_t forRunning, I_GXRef** ref, int32_t* error) {
    if (!path || !ref) {
        if (ref) {
            *ref = nullptr;
        }
        return Refuse(error, kWBArgErr, E_INVALIDARG);
    }
    *ref = nullptr;
    if (const int32_t hostError = value_.hostError()) {
        return Answer(error, hostError);
    }
    try {
        CQVComObject<CGXRef>* raw = nullptr;
        const HRESULT hr = CQVComObject<CGXRef>::CreateInstance(&raw, value_, std::string(path),
                                                                options, flags, forRunning != 0);
        if (hr == E_OUTOFMEMORY) {
            return Refuse(error, kWBMemFullErr, E_OUTOFMEMORY);
        }
        if (FAILED(hr)) {
            return Refuse(error, kWBGenericErr, hr);
        }
        const auto created = qv::com::ComPtr<CQVComObject<CGXRef>>::Adopt(raw);
        if (const int32_t hostError = raw->value().hostError()) {
            return Answer(error, hostError);
        }
        raw->QueryInterface(I_GXRef::iid, reinterpret_cast<void**>(ref));
        return Answer(error, *ref ? kWBNoErr : kWBGenericErr);
    } catch (const std::bad_alloc&) {
        return Refuse(error, kWBMemFullErr, E_OUTOFMEMORY);
    }
}

template <class Operation> HRESULT CGXRef::Guarded(int32_t* error, Operation&& operation) {
    if (!value_.IsValid()) {
        return Answer(error, kWBArgErr);
    }
    if (const int32_t hostError = value_.hostError()) {
        return Answer(error, hostError);
    }
    return Answer(error, operation());
}

HRESULT CGXRef::SetControlValueByIndex(int32_t index, double value, int32_t* error) {
    return Guarded(error, [&] { return value_.SetControlValue(index, value); });
}

HRESULT CGXRef::Run(int32_t* error, int32_t, int32_t, int32_t wait) {
    return Guarded(error, [&] { return value_.Run(wait); });
}

HRESULT CGXRef::GetControlValueByIndex(int32_t index, void** data, const uint8_t** type,
                                       int32_t* error) {
    if (!data || !type) {
        return Answer(error, kWBArgErr);
    }
    *data = nullptr;
    *type = nullptr;
    return Guarded(error, [&] { return value_.GetControlValue(index, data, type); });
}
