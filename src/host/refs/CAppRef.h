// The application reference object (I_AppRef) and the program reference object (I_GXRef).
#pragma once

#include "com/InterfaceList.h"
#include "host/refs/RefInterfaces.h"
#include "host/refs/WBRef.h"

class CAppRef : public I_AppRef {
public:
    using Interfaces = qv::com::InterfaceList<I_AppRef>;

    CAppRef(std::string versionName, int kind, int openMode)
        : value_(std::move(versionName), kind, openMode) {}

    HRESULT OpenProgramRef(const char* path, uint32_t options, uint32_t flags, int32_t forRunning,
                           I_GXRef** ref, int32_t* error) override;

    const qv::host::refs::AppRef& value() const { return value_; }

private:
    qv::host::refs::AppRef value_;
};

class CGXRef : public I_GXRef {
public:
    using Interfaces = qv::com::InterfaceList<I_GXRef>;

    CGXRef(const qv::host::refs::AppRef& app, const std::string& path, uint32_t options,
           uint32_t flags, bool forRunning)
        : value_(app, path, options, flags, forRunning) {}

    HRESULT SetControlValueByIndex(int32_t index, double value, int32_t* error) override;
    HRESULT Run(int32_t* error, int32_t reserved1, int32_t reserved2, int32_t wait) override;
    HRESULT GetControlValueByIndex(int32_t index, void** data, const uint8_t** type,
                                   int32_t* error) override;

    const qv::host::refs::GXRef& value() const { return value_; }

private:
    // Runs OPERATION unless the reference is invalid (error 1) or already holds a host error
    // (answered again without calling the host).
    template <class Operation> HRESULT Guarded(int32_t* error, Operation&& operation);

    qv::host::refs::GXRef value_;
};
