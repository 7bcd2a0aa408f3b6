// GUID text on arbitrary bytes (as narrow and as UTF-16 text): either BadGuidString, or a GUID
// whose upper-case text parses back to the same GUID and equals the input ignoring case.
#include "kern/GuidText.h"
#include "kern/exception/Exception.h"

#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

void Check(const qv::kern::Guid& guid, std::string_view input) {
    const std::string text = qv::kern::GuidToNarrowString(guid);
    if (qv::kern::StringToGuid(text) != guid ||
        qv::kern::StringToGuid(qv::kern::GuidToString(guid)) != guid)
        std::abort();
    for (size_t i = 0; i < text.size(); ++i) {
        if (std::toupper(static_cast<unsigned char>(input[i])) != text[i])
            std::abort();
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view narrow(reinterpret_cast<const char*>(data), size);
    try {
        Check(qv::kern::StringToGuid(narrow), narrow);
    } catch (const qv::kern::exception::BadGuidString&) {
    }
    std::u16string wide(narrow.begin(), narrow.end());
    if (size > 0)
        wide[size / 2] = static_cast<char16_t>(wide[size / 2] | (data[0] << 8));
    try {
        const qv::kern::Guid guid = qv::kern::StringToGuid(wide);
        if (qv::kern::StringToGuid(qv::kern::GuidToString(guid)) != guid)
            std::abort();
    } catch (const qv::kern::exception::BadGuidString&) {
    }
    return 0;
}
