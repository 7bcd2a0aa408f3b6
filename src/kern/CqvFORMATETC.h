// A clipboard format description, initialised to plain text in global memory.
#pragma once

#include <cstdint>

namespace qv::kern {

// The fields of a standard FORMATETC, in its layout: clipboard format, target device, aspect,
// index and storage medium.
struct FormatEtc {
    uint16_t cfFormat;
    void* ptd;
    uint32_t dwAspect;
    int32_t lindex;
    uint32_t tymed;
};

} // namespace qv::kern

namespace Bytefair {

// Holds a FormatEtc initialised to text (format 1), no target device, content aspect (1), index
// -1 and global memory (medium 1). Equal when all five fields are equal.
class CqvFORMATETC {
public:
    CqvFORMATETC() = default;
    // Holds a copy of the given fields.
    explicit CqvFORMATETC(const qv::kern::FormatEtc& fields) : fields_(fields) {}
    CqvFORMATETC(const CqvFORMATETC&) = default;
    CqvFORMATETC& operator=(const CqvFORMATETC&) = default;
    virtual ~CqvFORMATETC() = default;

    // The held fields.
    const qv::kern::FormatEtc& Get() const noexcept { return fields_; }
    qv::kern::FormatEtc& Get() noexcept { return fields_; }

    friend bool operator==(const CqvFORMATETC& a, const CqvFORMATETC& b) noexcept {
        return a.fields_.cfFormat == b.fields_.cfFormat && a.fields_.ptd == b.fields_.ptd &&
               a.fields_.dwAspect == b.fields_.dwAspect && a.fields_.lindex == b.fields_.lindex &&
               a.fields_.tymed == b.fields_.tymed;
    }

private:
    qv::kern::FormatEtc fields_{1, nullptr, 1, -1, 1};
};

} // namespace Bytefair
