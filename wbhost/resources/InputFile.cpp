// Reading files from outside the host.
#include "resources/InputFile.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unicode/unistr.h>
#include <unistd.h>

namespace wbhost::resources {
namespace {

constexpr std::string_view kUtf8Mark = "\xEF\xBB\xBF";
constexpr std::string_view kUtf16LittleMark = "\xFF\xFE";
constexpr std::string_view kUtf16BigMark = "\xFE\xFF";

class Descriptor {
public:
    explicit Descriptor(int fd) noexcept : fd_(fd) {}
    ~Descriptor() {
        if (fd_ >= 0)
            ::close(fd_);
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    int Get() const noexcept { return fd_; }

private:
    int fd_;
};

std::string SizeText(size_t bytes) {
    return bytes % (1024 * 1024) == 0 ? std::to_string(bytes / (1024 * 1024)) + " MiB"
                                      : std::to_string(bytes) + " bytes";
}

// Why the file open as FD, described by INFO, may not be read; empty when it may.
std::string Refusal(const struct stat& info, size_t limit) {
    if (S_ISDIR(info.st_mode))
        return "it is a folder";
    if (!S_ISREG(info.st_mode))
        return "it is not a regular file (a FIFO, device or socket)";
    if (static_cast<unsigned long long>(info.st_size) > limit)
        return "it is larger than " + SizeText(limit);
    return {};
}

// Opens PATH without blocking on a FIFO and checks it; -1 with ERROR set when refused.
int OpenChecked(const std::string& path, size_t limit, std::string& error) {
    const int fd = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0) {
        error = path + ": " + std::strerror(errno);
        return -1;
    }
    struct stat info {};
    if (::fstat(fd, &info) != 0) {
        error = path + ": " + std::strerror(errno);
    } else if (std::string why = Refusal(info, limit); !why.empty()) {
        error = path + ": " + why;
    } else {
        return fd;
    }
    ::close(fd);
    return -1;
}

std::u16string DecodeUtf16(std::string_view bytes, bool bigEndian) {
    std::u16string text;
    text.reserve(bytes.size() / 2);
    for (size_t i = 0; i + 1 < bytes.size(); i += 2) {
        const auto first = static_cast<unsigned char>(bytes[i]);
        const auto second = static_cast<unsigned char>(bytes[i + 1]);
        text.push_back(
            static_cast<char16_t>(bigEndian ? (first << 8) | second : (second << 8) | first));
    }
    return text;
}

} // namespace

bool CheckInputFile(const std::string& path, std::string& error, size_t limit) {
    const Descriptor file(OpenChecked(path, limit, error));
    return file.Get() >= 0;
}

bool ReadInputFile(const std::string& path, std::string& content, std::string& error,
                   size_t limit) {
    const Descriptor file(OpenChecked(path, limit, error));
    if (file.Get() < 0)
        return false;
    std::string bytes;
    char block[64 * 1024];
    for (;;) {
        const ssize_t n = ::read(file.Get(), block, sizeof block);
        if (n < 0 && errno == EINTR)
            continue;
        if (n < 0) {
            error = path + ": " + std::strerror(errno);
            return false;
        }
        if (n == 0)
            break;
        // The file may grow while it is read; the limit holds for what is read, too.
        if (bytes.size() + static_cast<size_t>(n) > limit) {
            error = path + ": it is larger than " + SizeText(limit);
            return false;
        }
        bytes.append(block, static_cast<size_t>(n));
    }
    content = std::move(bytes);
    return true;
}

std::u16string DecodeDocument(std::string_view bytes) {
    if (bytes.starts_with(kUtf16LittleMark))
        return DecodeUtf16(bytes.substr(kUtf16LittleMark.size()), false);
    if (bytes.starts_with(kUtf16BigMark))
        return DecodeUtf16(bytes.substr(kUtf16BigMark.size()), true);
    const std::string_view utf8 = WithoutByteOrderMark(bytes);
    const icu::UnicodeString decoded = icu::UnicodeString::fromUTF8(
        icu::StringPiece(utf8.data(), static_cast<int32_t>(utf8.size())));
    return std::u16string(decoded.getBuffer(), static_cast<size_t>(decoded.length()));
}

std::string_view WithoutByteOrderMark(std::string_view bytes) {
    return bytes.starts_with(kUtf8Mark) ? bytes.substr(kUtf8Mark.size()) : bytes;
}

} // namespace wbhost::resources
