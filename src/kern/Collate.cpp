// Case-insensitive comparison in the user's default locale, one collator per thread.
#include "kern/Collate.h"

#include "kern/NameCollator.h"

#include <cstring>
#include <string>
#include <unicode/uloc.h>

namespace qv::kern {
namespace {

// The C and POSIX locales map to ICU's en_US_POSIX, whose tailoring keeps case differences at
// secondary strength; the root collation is what a user of such a locale expects instead.
std::string CollationLocale() {
    const char* loc = uloc_getDefault();
    if (loc == nullptr || std::strncmp(loc, "en_US_POSIX", 11) == 0 || std::strcmp(loc, "c") == 0)
        return std::string();
    return loc;
}

// The locale is read once, so that every thread's collator orders names alike.
const std::string& ProcessCollationLocale() {
    static const std::string locale = CollationLocale();
    return locale;
}

// One collator per thread: construction is the only costly step and no thread waits on another.
const NameCollator& ThreadCollator() {
    thread_local const NameCollator collator(ProcessCollationLocale().c_str());
    return collator;
}

} // namespace

int CompareNoCase(std::u16string_view a, std::u16string_view b) noexcept {
    try {
        return ThreadCollator().Compare(a, b);
    } catch (...) {
        // Building the collator may run out of memory; the comparison then fails as ICU would.
        return 0;
    }
}

uint64_t NameOrderKey(std::u16string_view name) noexcept {
    try {
        return ThreadCollator().OrderKey(name);
    } catch (...) {
        return 0;
    }
}

} // namespace qv::kern
