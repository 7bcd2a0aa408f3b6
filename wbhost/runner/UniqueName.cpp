// The unique-name algorithm.
#include "runner/UniqueName.h"

#include "kern/Collate.h"

#include <algorithm>

namespace wbhost::runner {

namespace {

bool IsTaken(const std::u16string& name, const std::vector<std::u16string>& taken) {
    return std::any_of(taken.begin(), taken.end(), [&](const std::u16string& other) {
        return qv::kern::EqualsNoCase(name, other);
    });
}

std::u16string NumberText(size_t number) {
    const std::string digits = std::to_string(number);
    return std::u16string(digits.begin(), digits.end());
}

} // namespace

std::u16string UniqueName(const std::u16string& proposed,
                          const std::vector<std::u16string>& taken) {
    if (!proposed.empty() && !IsTaken(proposed, taken)) {
        return proposed;
    }
    // "Line3" taken gives "Line1" when that is free: the number restarts at the stem, so names
    // fill the gaps the user left rather than growing past the highest one.
    const size_t end = proposed.find_last_not_of(u"0123456789");
    const std::u16string stem =
        end == std::u16string::npos ? proposed : proposed.substr(0, end + 1);
    // Among size + 1 candidates one is always free, so the loop ends.
    for (size_t number = 1;; ++number) {
        std::u16string candidate = stem + NumberText(number);
        if (!IsTaken(candidate, taken)) {
            return candidate;
        }
    }
}

} // namespace wbhost::runner
