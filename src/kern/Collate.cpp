// Case-insensitive comparison through an ICU collator of the user's default locale.
#include "kern/Collate.h"

#include <unicode/ucol.h>
#include <unicode/uloc.h>

#include <cstdlib>
#include <cstring>
#include <memory>

namespace qv::kern {
namespace {

struct CollatorCloser {
    void operator()(UCollator* c) const noexcept { ucol_close(c); }
};
using CollatorPtr = std::unique_ptr<UCollator, CollatorCloser>;

// The C and POSIX locales map to ICU's en_US_POSIX, whose tailoring keeps case differences at
// secondary strength; the root collation is what a user of such a locale expects instead.
const char* CollationLocale() {
    const char* loc = uloc_getDefault();
    if (loc == nullptr || std::strncmp(loc, "en_US_POSIX", 11) == 0 || std::strcmp(loc, "c") == 0)
        return "";
    return loc;
}

CollatorPtr OpenCollator() {
    UErrorCode status = U_ZERO_ERROR;
    CollatorPtr collator(ucol_open(CollationLocale(), &status));
    if (U_FAILURE(status))
        return nullptr;
    ucol_setStrength(collator.get(), UCOL_SECONDARY);
    return collator;
}

// One collator per thread: ICU collators may be shared for comparison, but a per-thread one
// keeps the answer independent of ICU's internal locking.
UCollator* ThreadCollator() {
    thread_local const CollatorPtr collator = OpenCollator();
    return collator.get();
}

} // namespace

int CompareNoCase(std::u16string_view a, std::u16string_view b) noexcept {
    UCollator* collator = ThreadCollator();
    if (collator == nullptr)
        return 0;
    const UCollationResult r =
        ucol_strcoll(collator, a.data(), static_cast<int32_t>(a.size()), b.data(),
                     static_cast<int32_t>(b.size()));
    return r == UCOL_LESS ? -1 : (r == UCOL_GREATER ? 1 : 0);
}

} // namespace qv::kern
