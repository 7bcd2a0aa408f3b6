// TIO_CompareTwoResourceTrees: whether an offered resource description satisfies a required one.
#include "exports/Export.h"
#include "resource_tree/ResourceCompare.h"

#include <cstdint>
#include <string_view>

// Compares two zero-terminated multibyte resource-tree XML texts (null reads as empty): 0 match,
// 1 not satisfied, 2 tolerated difference. A text that cannot be decoded or loaded at all cannot
// show that the offered resource satisfies the required one, so any failure answers 1.
WBT_EXPORT uint32_t TIO_CompareTwoResourceTrees(const char* first, const char* second) noexcept {
    try {
        const std::string_view a = first != nullptr ? std::string_view(first) : std::string_view();
        const std::string_view b =
            second != nullptr ? std::string_view(second) : std::string_view();
        return wbhw::CompareResourceTexts(a, b);
    } catch (...) {
        return wbhw::kNotSatisfied;
    }
}
