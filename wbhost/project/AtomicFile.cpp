// Atomic file replacement over POSIX calls.
#include "project/AtomicFile.h"

#include "resources/InputFile.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace wbhost::project {

namespace {

class FileDescriptor {
public:
    explicit FileDescriptor(int fd) : fd_(fd) {}
    ~FileDescriptor() {
        if (fd_ >= 0)
            ::close(fd_);
    }
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    int Get() const noexcept { return fd_; }
    // Closes now, answering whether the close (which may report a late write error) worked.
    bool Close() {
        const int fd = fd_;
        fd_ = -1;
        return ::close(fd) == 0;
    }

private:
    int fd_;
};

bool Fail(std::string* error, const std::string& what, const std::string& path) {
    if (error != nullptr)
        *error = what + " \"" + path + "\": " + std::strerror(errno);
    return false;
}

bool WriteAll(int fd, std::string_view content) {
    while (!content.empty()) {
        const ssize_t written = ::write(fd, content.data(), content.size());
        if (written < 0) {
            if (errno == EINTR)
                continue;
            return false;
        }
        content.remove_prefix(static_cast<size_t>(written));
    }
    return true;
}

std::string FolderOf(const std::string& path) {
    const size_t slash = path.rfind('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

} // namespace

std::string TemporaryFileFor(const std::string& path) {
    return path + ".tmp";
}

bool WriteFileAtomically(const std::string& path, std::string_view content, std::string* error,
                         const std::function<bool()>& beforeRename) {
    // Same folder, so the rename never crosses file systems and stays atomic. The name is fixed,
    // so a file left by a save that was killed half-way is replaced by the next one instead of
    // piling up; it is made afresh (O_EXCL, never through a link someone planted there).
    const std::string temporary = TemporaryFileFor(path);
    if (::unlink(temporary.c_str()) != 0 && errno != ENOENT)
        return Fail(error, "cannot remove the unfinished save", temporary);
    FileDescriptor file(
        ::open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (file.Get() < 0)
        return Fail(error, "cannot create a temporary file beside", path);
    // The file starts private; give it the old file's mode, or the usual one.
    struct stat old {};
    if (::stat(path.c_str(), &old) == 0) {
        ::fchmod(file.Get(), old.st_mode & 07777);
    } else {
        const mode_t mask = ::umask(0);
        ::umask(mask);
        ::fchmod(file.Get(), 0666 & ~mask);
    }
    auto abandon = [&](const std::string& what) {
        Fail(error, what, temporary);
        ::unlink(temporary.c_str());
        return false;
    };
    if (!WriteAll(file.Get(), content))
        return abandon("cannot write");
    if (::fsync(file.Get()) != 0)
        return abandon("cannot flush");
    if (!file.Close())
        return abandon("cannot close");
    if (beforeRename && !beforeRename()) {
        if (error != nullptr)
            *error = "stopped before replacing \"" + path + "\"";
        return false;
    }
    if (::rename(temporary.c_str(), path.c_str()) != 0)
        return abandon("cannot rename over \"" + path + "\" the file");
    // The rename itself lives in the folder: flush it too, or a crash may forget it.
    const std::string folder = FolderOf(path);
    FileDescriptor dir(::open(folder.c_str(), O_RDONLY | O_DIRECTORY));
    if (dir.Get() >= 0)
        ::fsync(dir.Get());
    return true;
}

bool ReadWholeFile(const std::string& path, std::string& content, std::string* error) {
    std::string why;
    if (resources::ReadInputFile(path, content, why))
        return true;
    if (error != nullptr)
        *error = std::move(why);
    return false;
}

} // namespace wbhost::project
