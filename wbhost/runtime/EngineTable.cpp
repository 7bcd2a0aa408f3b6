// The host's engine function table: connections that only count, and programs that the
// program session's opener makes.
#include "runtime/EngineTable.h"

#include "runtime/HostFolder.h"

#include <array>
#include <map>
#include <mutex>

namespace wbhost::runtime {
namespace {

std::mutex openerLock;
EngineProgramOpener opener;

// The programs open, by the handle given out for each, so a stale or foreign handle is refused
// instead of followed.
std::mutex programsLock;
std::map<void*, std::unique_ptr<EngineProgram>> programs;

EngineProgram* Program(void* handle) {
    const std::lock_guard hold(programsLock);
    const auto found = programs.find(handle);
    return found != programs.end() ? found->second.get() : nullptr;
}

// The one connection every reference of this process shares: the host is the engine.
int connectionAnchor = 0;

int32_t Open(void** connection, int32_t /*mode*/, int32_t /*flags*/) {
    if (connection == nullptr)
        return kWBArgErr;
    *connection = &connectionAnchor;
    return kWBNoErr;
}

int32_t Close(void* /*connection*/) {
    return kWBNoErr;
}

int32_t Start(void* /*connection*/) {
    return kWBNoErr;
}

int32_t OpenByName(void** connection, int32_t mode, int32_t flags, const char* /*name*/) {
    return Open(connection, mode, flags);
}

int32_t OpenProgram(void* /*connection*/, const char* path, uint32_t /*options*/,
                    uint32_t /*flags*/, void** program) {
    if (path == nullptr || program == nullptr)
        return kWBArgErr;
    *program = nullptr;
    EngineProgramOpener open;
    {
        const std::lock_guard hold(openerLock);
        open = opener;
    }
    if (!open)
        return kWBFileNotFound;
    try {
        std::unique_ptr<EngineProgram> opened;
        const WBErr error = open(ResolveProgramPath(path), opened);
        if (error != kWBNoErr)
            return error;
        if (!opened)
            return kWBGenericErr;
        void* handle = opened.get();
        const std::lock_guard hold(programsLock);
        programs.emplace(handle, std::move(opened));
        *program = handle;
        return kWBNoErr;
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    } catch (...) {
        return kWBGenericErr;
    }
}

int32_t CloseProgram(void* program) {
    std::unique_ptr<EngineProgram> closed;
    {
        const std::lock_guard hold(programsLock);
        const auto found = programs.find(program);
        if (found == programs.end())
            return kWBArgErr;
        closed = std::move(found->second);
        programs.erase(found);
    }
    return kWBNoErr;
}

int32_t PrepareProgram(void* program, int32_t* count, WBTerminal** terminals) {
    EngineProgram* open = Program(program);
    if (open == nullptr || count == nullptr || terminals == nullptr)
        return kWBArgErr;
    return open->Prepare(count, terminals);
}

int32_t RunProgram(void* program, int32_t /*wait*/) {
    EngineProgram* open = Program(program);
    return open != nullptr ? open->Run() : kWBArgErr;
}

int32_t NumericClass(const uint8_t* type) {
    // The classes of the engine's own type codes: only the integer and float codes are numbers.
    switch (type != nullptr ? type[1] : 0) {
    case kWBTypeI8:
        return 0;
    case kWBTypeU8:
        return 1;
    case kWBTypeI16:
        return 2;
    case kWBTypeU16:
        return 3;
    case kWBTypeI32:
        return 4;
    case kWBTypeU32:
        return 5;
    case kWBTypeI64:
        return 6;
    case kWBTypeU64:
        return 7;
    case kWBTypeF64:
        return 9;
    case kWBTypeF32:
        return 10;
    default:
        return 15;
    }
}

template <class Fn> const void* Slot(Fn* function) {
    return reinterpret_cast<const void*>(function);
}

constexpr size_t kOpenByNameSlot = 109;

const std::array<const void*, kOpenByNameSlot + 1> table = [] {
    std::array<const void*, kOpenByNameSlot + 1> slots{};
    slots[0] = reinterpret_cast<const void*>(static_cast<uintptr_t>(kEngineTableRevision));
    slots[1] = Slot(&Open);
    slots[2] = Slot(&Close);
    slots[3] = Slot(&Start);
    slots[qv::host::refs::kOpenProgramSlot] = Slot(&OpenProgram);
    slots[qv::host::refs::kCloseProgramSlot] = Slot(&CloseProgram);
    slots[qv::host::refs::kPrepareProgramSlot] = Slot(&PrepareProgram);
    slots[qv::host::refs::kRunProgramSlot] = Slot(&RunProgram);
    slots[qv::host::refs::kNumericClassSlot] = Slot(&NumericClass);
    slots[kOpenByNameSlot] = Slot(&OpenByName);
    return slots;
}();

} // namespace

void SetEngineProgramOpener(EngineProgramOpener next) {
    const std::lock_guard hold(openerLock);
    opener = std::move(next);
}

std::string ResolveProgramPath(std::string_view path) {
    static constexpr std::string_view kLibrary = "<gxlib>:";
    std::string resolved;
    if (path.substr(0, kLibrary.size()) == kLibrary) {
        resolved = HostFolder() + "/gxlib";
        path.remove_prefix(kLibrary.size());
        if (!path.empty() && path.front() != '\\' && path.front() != '/')
            resolved += '/';
    }
    for (const char c : path)
        resolved += c == '\\' ? '/' : c;
    return resolved;
}

} // namespace wbhost::runtime

const void* const* GetCInterfaceFunctionTable() {
    return wbhost::runtime::table.data();
}
