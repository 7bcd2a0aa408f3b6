// Code-page conversion through ICU converters, one cached converter per name and thread.
#include "kern/CodePage.h"

#include "kern/exception/Exception.h"
#include "kern/osdep/OSException.h"

#include <algorithm>
#include <climits>
#include <cstdlib>
#include <memory>
#include <new>
#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>
#include <utility>
#include <vector>

namespace qv::kern {
namespace {

constexpr char kDefaultCodePage[] = "windows-1252";
constexpr char kCodePageVariable[] = "WBTANGIO_CODEPAGE";
// Windows error codes for a conversion that cannot run.
constexpr uint32_t kInvalidParameter = 87;
constexpr uint32_t kNoUnicodeTranslation = 1113;

struct ConverterCloser {
    void operator()(UConverter* c) const noexcept { ucnv_close(c); }
};
using ConverterPtr = std::unique_ptr<UConverter, ConverterCloser>;

[[noreturn]] void RaiseConversionFailure(UErrorCode status) {
    if (status == U_MEMORY_ALLOCATION_ERROR)
        throw std::bad_alloc();
    const bool badText = status == U_INVALID_CHAR_FOUND || status == U_ILLEGAL_CHAR_FOUND ||
                         status == U_TRUNCATED_CHAR_FOUND;
    QV_THROW(osdep::WinError(badText ? kNoUnicodeTranslation : kInvalidParameter));
}

// True when the converter name comes from the environment rather than from the fixed list.
bool IsConfiguredName(std::string_view codePage) {
    const char* configured = std::getenv(kCodePageVariable);
    return codePage.empty() && configured != nullptr && *configured != '\0';
}

// Writes the substitute for every character the page lacks. ICU's own substitution drops the
// default-ignorable ones (format controls such as U+200B or U+202C) without a trace, so a text
// would lose characters where a "?" shows that something was there.
void SubstituteEveryLackingCharacter(const void*, UConverterFromUnicodeArgs* args, const UChar*,
                                     int32_t, UChar32, UConverterCallbackReason reason,
                                     UErrorCode* status) {
    if (reason > UCNV_IRREGULAR)
        return; // reset, close and clone need nothing
    *status = U_ZERO_ERROR;
    ucnv_cbFromUWriteSub(args, 0, status);
}

ConverterPtr OpenConverter(const std::string& name, bool configured) {
    UErrorCode status = U_ZERO_ERROR;
    ConverterPtr converter(ucnv_open(name.c_str(), &status));
    if (U_FAILURE(status) || converter == nullptr) {
        // A misspelt WBTANGIO_CODEPAGE is a bad locale setting; a fixed name that ICU lacks is
        // the platform failing, as a missing code page is on Windows.
        if (configured && status != U_MEMORY_ALLOCATION_ERROR)
            QV_THROW(exception::InvalidLocale());
        RaiseConversionFailure(status);
    }
    // Windows writes "?" for characters a code page lacks; ICU's default would be SUB (0x1A).
    status = U_ZERO_ERROR;
    ucnv_setSubstChars(converter.get(), "?", 1, &status);
    ucnv_setFromUCallBack(converter.get(), SubstituteEveryLackingCharacter, nullptr, nullptr,
                          nullptr, &status);
    if (U_FAILURE(status))
        RaiseConversionFailure(status);
    return converter;
}

// This thread's converter for the name: converters keep state, so they are never shared.
UConverter* ThreadConverter(std::string_view codePage) {
    thread_local std::vector<std::pair<std::string, ConverterPtr>> cache;
    const std::string name = ConverterName(codePage);
    for (const auto& [cachedName, converter] : cache) {
        if (cachedName == name)
            return converter.get();
    }
    cache.emplace_back(name, OpenConverter(name, IsConfiguredName(codePage)));
    return cache.back().second.get();
}

int32_t CheckedLength(size_t size) {
    if (size > static_cast<size_t>(INT32_MAX))
        QV_THROW(osdep::WinError(kInvalidParameter));
    return static_cast<int32_t>(size);
}

} // namespace

std::string ConverterName(std::string_view codePage) {
    if (codePage == "US-ASCII" || codePage == "cp932")
        return std::string(codePage);
    if (!codePage.empty())
        QV_THROW(exception::InvalidLocale());
    const char* configured = std::getenv(kCodePageVariable);
    return configured != nullptr && *configured != '\0' ? std::string(configured)
                                                        : std::string(kDefaultCodePage);
}

std::u16string AnsiToWide(std::string_view text, std::string_view codePage) {
    UConverter* const converter = ThreadConverter(codePage);
    if (text.empty())
        return std::u16string();
    CheckedLength(text.size());
    // Whole descriptions come through here. The output grows a block at a time, so that the zero
    // fill of each block and ICU's writing meet the same cache lines, instead of a pass of zeros
    // over a buffer of the whole text first. One byte gives at most one UTF-16 unit in the code
    // pages we use, so room for the bytes left is room enough; a page that gives more only takes
    // another round.
    constexpr size_t kBlock = 16384;
    ucnv_resetToUnicode(converter);
    std::u16string out;
    out.reserve(text.size());
    const char* source = text.data();
    const char* const sourceEnd = source + text.size();
    for (;;) {
        const size_t used = out.size();
        const size_t left = static_cast<size_t>(sourceEnd - source);
        const size_t room = std::max<size_t>(std::min(kBlock, left), 2);
        out.resize(used + room);
        UChar* target = out.data() + used;
        UErrorCode status = U_ZERO_ERROR;
        ucnv_toUnicode(converter, &target, target + room, &source, sourceEnd, nullptr, true,
                       &status);
        out.resize(static_cast<size_t>(target - out.data()));
        if (status == U_BUFFER_OVERFLOW_ERROR)
            continue;
        if (U_FAILURE(status)) {
            ucnv_resetToUnicode(converter);
            RaiseConversionFailure(status);
        }
        return out; // with the flush, ICU stops early only when the room runs out
    }
}

std::string WideToAnsi(std::u16string_view text, std::string_view codePage) {
    UConverter* const converter = ThreadConverter(codePage);
    if (text.empty())
        return std::string();
    const int32_t length = CheckedLength(text.size());
    std::string out(text.size() * 2, '\0');
    UErrorCode status = U_ZERO_ERROR;
    int32_t bytes = ucnv_fromUChars(converter, out.data(), CheckedLength(out.size()), text.data(),
                                    length, &status);
    if (status == U_BUFFER_OVERFLOW_ERROR) {
        out.assign(static_cast<size_t>(bytes), '\0');
        status = U_ZERO_ERROR;
        bytes = ucnv_fromUChars(converter, out.data(), bytes, text.data(), length, &status);
    }
    if (U_FAILURE(status))
        RaiseConversionFailure(status);
    out.resize(static_cast<size_t>(bytes));
    return out;
}

} // namespace qv::kern
