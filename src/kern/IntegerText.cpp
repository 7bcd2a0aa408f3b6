// Integer text conversions.
#include "kern/IntegerText.h"

#include "kern/exception/Exception.h"

#include <algorithm>

namespace qv::kern {
namespace {

constexpr char16_t kDigits[] = u"0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZ";

void CheckBase(uint32_t base) {
    if (base < 2 || base > 36)
        QV_THROW(exception::UnableToConvert());
}

bool IsSpace(char16_t c) {
    return c == u' ' || (c >= u'\t' && c <= u'\r');
}

// The value of an ASCII digit or letter, or 36 (never a digit) for anything else. Letters of
// other scripts are not digits, whatever their case mapping says.
uint32_t DigitValue(char16_t c) {
    if (c >= u'0' && c <= u'9')
        return static_cast<uint32_t>(c - u'0');
    if (c >= u'A' && c <= u'Z')
        return static_cast<uint32_t>(c - u'A') + 10;
    if (c >= u'a' && c <= u'z')
        return static_cast<uint32_t>(c - u'a') + 10;
    return 36;
}

} // namespace

std::u16string IntegerToString(uint32_t value, uint32_t base) {
    CheckBase(base);
    std::u16string out;
    do {
        out.push_back(kDigits[value % base]);
        value /= base;
    } while (value != 0);
    std::reverse(out.begin(), out.end());
    return out;
}

uint32_t StringToInteger(std::u16string_view text, uint32_t base, bool* minus, bool strict) {
    CheckBase(base);
    if (minus != nullptr)
        *minus = false;
    size_t i = 0;
    while (i < text.size() && IsSpace(text[i]))
        ++i;
    if (i < text.size() && (text[i] == u'-' || text[i] == u'+')) {
        if (minus != nullptr)
            *minus = text[i] == u'-';
        ++i;
    }
    if (i == text.size()) {
        if (strict)
            QV_THROW(exception::UnableToConvert());
        return 0;
    }
    uint32_t value = 0;
    for (; i < text.size(); ++i) {
        const uint32_t digit = DigitValue(text[i]);
        if (digit >= base)
            break;
        if (__builtin_mul_overflow(value, base, &value) ||
            __builtin_add_overflow(value, digit, &value))
            QV_THROW(exception::UnableToConvert());
    }
    if (i < text.size() && strict)
        QV_THROW(exception::UnableToConvert());
    return value;
}

} // namespace qv::kern
