// Atomic file replacement over POSIX calls.
#include "project/AtomicFile.h"

#include "project/ProjectLock.h"
#include "resources/InputFile.h"

#include <cerrno>
#include <cstdlib>
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

std::string FollowLinks(const std::string& path) {
    std::string at = path;
    // As many hops as the system itself follows; a loop ends there and fails at the rename.
    for (int hop = 0; hop < 40; ++hop) {
        struct stat info {};
        if (::lstat(at.c_str(), &info) != 0 || !S_ISLNK(info.st_mode))
            return at;
        std::string target(static_cast<size_t>(info.st_size) + 1, '\0');
        const ssize_t n = ::readlink(at.c_str(), target.data(), target.size());
        if (n < 0 || static_cast<size_t>(n) >= target.size())
            return at;
        target.resize(static_cast<size_t>(n));
        at = target.front() == '/' ? target : FolderOf(at) + "/" + target;
    }
    return at;
}

bool WriteFileAtomically(const std::string& path, std::string_view content, std::string* error,
                         const std::function<bool()>& beforeRename, ProjectLock* lock) {
    // A link stays a link: the file it leads to is the one replaced. Same folder as that file,
    // so the rename never crosses file systems and stays atomic. The temporary name is made
    // afresh (O_EXCL, never through a link someone planted there) and unique to this save.
    const std::string target = FollowLinks(path);
    std::string temporary = target + ".tmp-XXXXXX";
    FileDescriptor file(::mkostemp(temporary.data(), O_CLOEXEC));
    if (file.Get() < 0)
        return Fail(error, "cannot create a temporary file beside", target);
    // The file starts private; give it the old file's mode, or the usual one.
    struct stat old {};
    if (::stat(target.c_str(), &old) == 0) {
        ::fchmod(file.Get(), old.st_mode & 07777);
    } else {
        const mode_t mask = ::umask(0);
        ::umask(mask);
        ::fchmod(file.Get(), 0666 & ~mask);
    }
    int locked = -1;
    auto abandon = [&](const std::string& what) {
        Fail(error, what, temporary);
        ::unlink(temporary.c_str());
        if (locked >= 0)
            ::close(locked);
        return false;
    };
    if (!WriteAll(file.Get(), content))
        return abandon("cannot write");
    if (::fsync(file.Get()) != 0)
        return abandon("cannot flush");
    if (lock != nullptr && (locked = ProjectLock::LockNewFile(file.Get())) < 0)
        return abandon("cannot lock");
    if (!file.Close())
        return abandon("cannot close");
    if (beforeRename && !beforeRename()) {
        if (locked >= 0)
            ::close(locked);
        if (error != nullptr)
            *error = "stopped before replacing \"" + path + "\"";
        return false;
    }
    if (::rename(temporary.c_str(), target.c_str()) != 0)
        return abandon("cannot rename over \"" + target + "\" the file");
    if (lock != nullptr)
        lock->Adopt(path, locked);
    // The rename itself lives in the folder: flush it too, or a crash may forget it.
    const std::string folder = FolderOf(target);
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
