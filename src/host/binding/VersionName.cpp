// Version names of run-time engines. Installed engines are filed under "major.minor", while the
// names programs carry may add a patch level and a release suffix.
#include "host/binding/VersionName.h"

#include <algorithm>

namespace qv::host::rt {

namespace {

constexpr size_t kScannedLength = 11;
constexpr size_t kMaxStoredLength = 11;

bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}
bool IsReleaseLetter(char c) {
    return c == 'd' || c == 'a' || c == 'b' || c == 'f';
}

} // namespace

std::optional<std::string> ShortVersionName(std::string_view version) {
    const size_t scanned = std::min(version.size(), kScannedLength);
    bool seenDot = false;
    for (size_t i = 0; i < scanned; ++i) {
        if (version[i] != '.') {
            continue;
        }
        if (seenDot) {
            return std::string(version.substr(0, i));
        }
        seenDot = true;
        if (i + 3 < version.size() && IsDigit(version[i + 1]) && IsReleaseLetter(version[i + 2]) &&
            IsDigit(version[i + 3])) {
            return std::string(version.substr(0, i + 2));
        }
    }
    return std::nullopt;
}

std::string StoredVersionName(std::string_view version) {
    return version.size() <= kMaxStoredLength ? std::string(version) : std::string();
}

} // namespace qv::host::rt
