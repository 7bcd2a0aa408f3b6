// The variant table.
#include "runtime/VariantTable.h"

#include <new>

namespace wbhost::runtime {

VariantTable& VariantTable::Instance() {
    static VariantTable table;
    return table;
}

WBVariant VariantTable::Create(VariantData data) {
    try {
        auto record = std::make_unique<WBVariantRec>(WBVariantRec{std::move(data)});
        WBVariant variant = record.get();
        const std::lock_guard hold(lock_);
        variants_.emplace(variant, std::move(record));
        return variant;
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

bool VariantTable::IsLive(WBVariant variant) const {
    const std::lock_guard hold(lock_);
    return variant != nullptr && variants_.count(variant) != 0;
}

bool VariantTable::Destroy(WBVariant variant) {
    std::unique_ptr<WBVariantRec> released;
    const std::lock_guard hold(lock_);
    const auto found = variants_.find(variant);
    if (variant == nullptr || found == variants_.end()) {
        return false;
    }
    released = std::move(found->second);
    variants_.erase(found);
    return true;
}

size_t VariantTable::LiveCount() const {
    const std::lock_guard hold(lock_);
    return variants_.size();
}

} // namespace wbhost::runtime
