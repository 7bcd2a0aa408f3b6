// Integer text on arbitrary input: the first byte picks the base and the strict flag, the rest
// is read as UTF-16. Whatever is accepted must agree with a plain 64-bit reading and print back.
#include "kern/IntegerText.h"
#include "kern/exception/Exception.h"

#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

uint32_t Digit(char16_t c) {
    if (c >= u'0' && c <= u'9')
        return c - u'0';
    if (c >= u'A' && c <= u'Z')
        return c - u'A' + 10;
    if (c >= u'a' && c <= u'z')
        return c - u'a' + 10;
    return 99;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    const uint32_t base = data[0] % 40;
    const bool strict = (data[0] & 0x80) != 0;
    std::u16string text;
    for (size_t i = 1; i + 1 < size; i += 2)
        text.push_back(static_cast<char16_t>(data[i] | (data[i + 1] << 8)));
    bool minus = false;
    uint32_t value = 0;
    try {
        value = qv::kern::StringToInteger(text, base, &minus, strict);
    } catch (const qv::kern::exception::UnableToConvert&) {
        return 0;
    }
    // Recompute with a wide accumulator: the same digits must give the same value.
    size_t i = 0;
    while (i < text.size() && (text[i] == u' ' || (text[i] >= u'\t' && text[i] <= u'\r')))
        ++i;
    if (i < text.size() && (text[i] == u'-' || text[i] == u'+'))
        ++i;
    uint64_t expected = 0;
    for (; i < text.size() && Digit(text[i]) < base; ++i)
        expected = expected * base + Digit(text[i]);
    if (expected != value || (strict && i != text.size()))
        std::abort();
    if (qv::kern::StringToInteger(qv::kern::IntegerToString(value, base), base, nullptr, true) !=
        value)
        std::abort();
    return 0;
}
