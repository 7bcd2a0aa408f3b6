// An array of BSTRs handed across an interface in one CoTaskMemAlloc block (a count beside it):
// the receiver owns every text and the block.
#pragma once

#include "com/Bstr.h"

#include <cstdint>
#include <string>
#include <vector>

namespace qv::com {

class BstrArray {
public:
    BstrArray() = default;
    // Frees the texts and the block.
    ~BstrArray();
    BstrArray(const BstrArray&) = delete;
    BstrArray& operator=(const BstrArray&) = delete;

    // The slots to hand an operation that answers COUNT texts in *TEXTS; whatever was held before
    // is freed first.
    BSTR** PutTexts();
    uint32_t* PutCount() { return &count_; }

    uint32_t Count() const { return texts_ != nullptr ? count_ : 0; }
    // Each text in order (a null text reads as empty).
    std::vector<std::u16string> Texts() const;

private:
    void Free() noexcept;

    BSTR* texts_ = nullptr;
    uint32_t count_ = 0;
};

} // namespace qv::com
