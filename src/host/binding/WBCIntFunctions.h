// Wrappers over a run-time engine's C-interface function table, one class per table version.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstdint>
#include <memory>

namespace qv::host::rt {

// The oldest table: a revision followed by function pointers. Valid when the revision is above 0.
class WBCIntFunctions {
public:
    // Wraps `table` (not owned; it lives as long as its library). A null table is never valid.
    explicit WBCIntFunctions(const void* const* table) noexcept : table_(table) {}
    virtual ~WBCIntFunctions() = default;
    // Whether the table is recent enough for this class.
    virtual bool IsValid() const noexcept { return Revision() > 0; }

    // The revision: the low 32 bits of the table's first, pointer-sized field; 0 for no table.
    uint32_t Revision() const noexcept;
    // Function `slot` (1 = open, 2 = close, 3 = start, 109 = open by name); null for no table.
    template <class Fn> Fn* Function(size_t slot) const noexcept {
        return table_ != nullptr ? reinterpret_cast<Fn*>(const_cast<void*>(table_[slot])) : nullptr;
    }

    WBCIntOpenFn* Open() const noexcept { return Function<WBCIntOpenFn>(1); }
    WBCIntCloseFn* Close() const noexcept { return Function<WBCIntCloseFn>(2); }
    WBCIntStartFn* Start() const noexcept { return Function<WBCIntStartFn>(3); }
    // Open by application name; null when the table is older than revision 40 and lacks it.
    WBCIntOpenByNameFn* OpenByName() const noexcept;

private:
    const void* const* table_;
};

// Declares a table version that adds a minimum revision to its base's test.
#define QV_WBCINT_VERSION(Name, Base, MinRevision)                                                 \
    class Name : public Base {                                                                     \
    public:                                                                                        \
        using Base::Base;                                                                          \
        bool IsValid() const noexcept override {                                                   \
            return Base::IsValid() && Revision() >= (MinRevision);                                 \
        }                                                                                          \
    }

QV_WBCINT_VERSION(WBCIntFunctions80, WBCIntFunctions, 18u);
QV_WBCINT_VERSION(WBCIntFunctions82, WBCIntFunctions80, 20u);

// Versions 86 and 861 add functions but no test of their own.
class WBCIntFunctions86 : public WBCIntFunctions82 {
public:
    using WBCIntFunctions82::WBCIntFunctions82;
};

class WBCIntFunctions861 : public WBCIntFunctions86 {
public:
    using WBCIntFunctions86::WBCIntFunctions86;
};

QV_WBCINT_VERSION(WBCIntFunctions90, WBCIntFunctions861, 30u);

#undef QV_WBCINT_VERSION

// The most recent version class that is valid for `table`; null when none is (no table, or
// revision 0).
std::unique_ptr<WBCIntFunctions> WrapFunctionTable(const void* const* table);

} // namespace qv::host::rt
