// Code-page conversion of arbitrary bytes and UTF-16 units in each page the module names. A text
// converted to a page and back settles after one round: converting it again changes nothing.
#include "FuzzCheck.h"
#include "kern/CodePage.h"

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

namespace {

constexpr std::string_view kPages[] = {"", "US-ASCII", "cp932"};

using wbt::fuzz::Check;

} // namespace

// The first byte picks the page and whether the rest is read as bytes of that page or as UTF-16
// units (lone surrogates included).
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    const std::string_view page = kPages[data[0] % 3];
    const std::string_view rest(reinterpret_cast<const char*>(data) + 1, size - 1);
    std::u16string wide;
    if ((data[0] & 4) == 0) {
        wide = qv::kern::AnsiToWide(rest, page);
        Check(wide.empty() == rest.empty());
    } else {
        for (size_t i = 0; i + 1 < rest.size(); i += 2)
            wide.push_back(static_cast<char16_t>(static_cast<uint8_t>(rest[i]) |
                                                 (static_cast<uint8_t>(rest[i + 1]) << 8)));
    }
    const std::string once = qv::kern::WideToAnsi(wide, page);
    Check(once.empty() == wide.empty());
    const std::u16string back = qv::kern::AnsiToWide(once, page);
    Check(qv::kern::WideToAnsi(back, page) == once);
    return 0;
}
