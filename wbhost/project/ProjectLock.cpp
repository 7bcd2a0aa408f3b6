// Project file locks over flock(2), shared within the process by file identity.
#include "project/ProjectLock.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <map>
#include <mutex>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace wbhost::project {

// One locked file of this process; the lock goes with the last holder.
struct LockedProjectFile {
    using Identity = std::pair<dev_t, ino_t>;
    LockedProjectFile(int fd, Identity identity) : fd(fd), identity(identity) {}
    ~LockedProjectFile();
    LockedProjectFile(const LockedProjectFile&) = delete;
    LockedProjectFile& operator=(const LockedProjectFile&) = delete;
    int fd;
    Identity identity;
};

namespace {

using Identity = std::pair<dev_t, ino_t>;

std::mutex heldLock;
std::map<Identity, std::weak_ptr<LockedProjectFile>>& Held() {
    static std::map<Identity, std::weak_ptr<LockedProjectFile>> held;
    return held;
}

bool Fail(std::string* error, const std::string& message) {
    if (error != nullptr)
        *error = message;
    return false;
}

bool IdentityOf(int fd, Identity& identity) {
    struct stat info {};
    if (::fstat(fd, &info) != 0)
        return false;
    identity = {info.st_dev, info.st_ino};
    return true;
}

// True when IDENTITY is still the file PATH names (no save renamed another file over it).
bool StillNamed(const Identity& identity, const std::string& path) {
    struct stat named {};
    return ::stat(path.c_str(), &named) == 0 && identity == Identity{named.st_dev, named.st_ino};
}

std::shared_ptr<LockedProjectFile> Register(int fd, const Identity& identity) {
    auto file = std::make_shared<LockedProjectFile>(fd, identity);
    const std::lock_guard<std::mutex> hold(heldLock);
    Held()[identity] = file;
    return file;
}

// This process's lock on IDENTITY, if it holds one.
std::shared_ptr<LockedProjectFile> HeldHere(const Identity& identity) {
    const std::lock_guard<std::mutex> hold(heldLock);
    const auto found = Held().find(identity);
    return found == Held().end() ? nullptr : found->second.lock();
}

} // namespace

LockedProjectFile::~LockedProjectFile() {
    {
        const std::lock_guard<std::mutex> hold(heldLock);
        const auto found = Held().find(identity);
        if (found != Held().end() && found->second.expired())
            Held().erase(found);
    }
    ::close(fd);
}

bool ProjectLock::Acquire(const std::string& path, std::string* error,
                          std::chrono::milliseconds wait) {
    Release();
    const auto deadline = std::chrono::steady_clock::now() + wait;
    for (;;) {
        const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
        if (fd < 0) {
            if (errno != ENOENT)
                return Fail(error, "cannot open \"" + path + "\": " + std::strerror(errno));
            path_ = path; // nothing to lock yet
            return true;
        }
        Identity identity;
        if (!IdentityOf(fd, identity)) {
            ::close(fd);
            return Fail(error, "cannot read \"" + path + "\": " + std::strerror(errno));
        }
        if (auto shared = HeldHere(identity)) {
            ::close(fd);
            path_ = path;
            file_ = std::move(shared);
            return true;
        }
        while (::flock(fd, LOCK_EX | LOCK_NB) != 0) {
            const int failed = errno;
            if ((failed != EWOULDBLOCK && failed != EINTR) ||
                std::chrono::steady_clock::now() >= deadline) {
                ::close(fd);
                if (failed != EWOULDBLOCK)
                    return Fail(error, "cannot lock \"" + path + "\": " + std::strerror(failed));
                return Fail(error, "the project \"" + path +
                                       "\" is being changed by another process; nothing was "
                                       "changed, try again once it is done");
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        }
        if (StillNamed(identity, path)) {
            path_ = path;
            file_ = Register(fd, identity);
            return true;
        }
        // The holder saved meanwhile: the lock that counts is the new file's.
        ::close(fd);
    }
}

int ProjectLock::LockNewFile(int fd) noexcept {
    const int copy = ::fcntl(fd, F_DUPFD_CLOEXEC, 0);
    if (copy >= 0 && ::flock(copy, LOCK_EX | LOCK_NB) != 0) {
        ::close(copy);
        return -1;
    }
    return copy;
}

void ProjectLock::Adopt(const std::string& path, int lockedFd) {
    Identity identity;
    if (!IdentityOf(lockedFd, identity)) {
        ::close(lockedFd);
        Release();
        return;
    }
    auto file = Register(lockedFd, identity);
    Release();
    path_ = path;
    file_ = std::move(file);
}

void ProjectLock::Release() noexcept {
    file_.reset();
    path_.clear();
}

} // namespace wbhost::project
