// The exports of the I/O name control: the list export the host looks for, and the upgrade of a
// control's data saved by an older host, which the host's own library program performs.
#include "exports/Export.h"
#include "host/refs/RefInterfaces.h"

#include <cstdint>
#include <cstring>

namespace {

// Data saved by host versions after this one is current.
constexpr int32_t kLastVersionToUpgrade = 0x10008000;
constexpr const char* kMutationProgram =
    "<gxlib>:\\rgx\\tio\\nameControl\\qvFpgaIONameControlOnMutation.gx";
constexpr uint32_t kMutationOptions = 0;
constexpr uint32_t kMutationFlags = 0x10000;
// The program's terminals: the control's value and the saving version in, the upgraded value
// out.
constexpr int32_t kValueControl = 0;
constexpr int32_t kVersionControl = 5;
constexpr int32_t kResultControl = 4;

// Releases a reference interface when it goes.
template <class I> struct Held {
    I* ref = nullptr;
    ~Held() {
        if (ref != nullptr)
            ref->Release();
    }
};

} // namespace

// Kept for hosts that look the export up; the names come through the provider.
WBT_EXPORT int32_t GetIOControlNames() noexcept {
    return 0;
}

// Upgrades a control's VALUE saved by host VERSION through the host's library program; answers
// the upgraded value (0 when the program gave none), 0 for current data, 1 when the program
// cannot be opened, or the host error that stopped it.
WBT_EXPORT int32_t IONameControlOnMutation(void* /*unused1*/, uint32_t value, void* /*unused3*/,
                                           int32_t version) noexcept {
    if (version > kLastVersionToUpgrade)
        return 0;
    Held<I_AppRef> app;
    int32_t error = 0;
    if (FAILED(OpenDefaultAppRef(&app.ref, &error)) || app.ref == nullptr)
        return 1;
    Held<I_GXRef> program;
    if (FAILED(app.ref->OpenProgramRef(kMutationProgram, kMutationOptions, kMutationFlags, 1,
                                       &program.ref, &error)) ||
        program.ref == nullptr)
        return 1;
    error = 0;
    int32_t result = 0;
    program.ref->SetControlValueByIndex(kValueControl, static_cast<double>(value), &error);
    if (error == 0)
        program.ref->SetControlValueByIndex(kVersionControl, static_cast<double>(version), &error);
    if (error == 0)
        program.ref->Run(&error, 0, 0, 1);
    if (error == 0) {
        void* data = nullptr;
        const uint8_t* type = nullptr;
        program.ref->GetControlValueByIndex(kResultControl, &data, &type, &error);
        if (error == 0 && data != nullptr)
            std::memcpy(&result, data, sizeof result);
    }
    return error != 0 ? error : result;
}
