// Arrays of BSTRs received from an interface.
#include "com/BstrArray.h"

#include "com/TaskMem.h"

namespace qv::com {

BstrArray::~BstrArray() {
    Free();
}

void BstrArray::Free() noexcept {
    if (texts_ != nullptr) {
        for (uint32_t i = 0; i < count_; ++i)
            SysFreeString(texts_[i]);
        CoTaskMemFree(texts_);
    }
    texts_ = nullptr;
    count_ = 0;
}

BSTR** BstrArray::PutTexts() {
    Free();
    return &texts_;
}

std::vector<std::u16string> BstrArray::Texts() const {
    std::vector<std::u16string> texts;
    texts.reserve(Count());
    for (uint32_t i = 0; i < Count(); ++i)
        texts.push_back(BstrToString(texts_[i]));
    return texts;
}

} // namespace qv::com
