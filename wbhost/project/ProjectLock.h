// The advisory lock that makes one project file's read-change-save a single step between wbhost
// processes: a second process waits for the first to finish, then reads what it saved.
#pragma once

#include <chrono>
#include <memory>
#include <string>

namespace wbhost::project {

struct LockedProjectFile;

// An exclusive lock on the file a project is kept in (links followed: the lock is on the file
// they lead to). Saves replace the file by renaming a new one over it, so the lock lives on the
// file, not the name: a waiter that gets the lock of a file that was replaced meanwhile starts
// again on the new one, and a save hands the lock over to the file it puts in place. Within one
// process the locks of one file are shared: a session may reopen the project it holds.
class ProjectLock {
public:
    // How long a process waits for another one's read-change-save before it gives up.
    static constexpr std::chrono::milliseconds kWait{5000};

    // Locks the file PATH, waiting up to WAIT while another process holds it. A PATH that does
    // not exist gives a lock that holds nothing (a new project's first save takes it over). False
    // with a message in ERROR (may be null) when the wait ran out or the file cannot be opened.
    bool Acquire(const std::string& path, std::string* error,
                 std::chrono::milliseconds wait = kWait);
    // The file the lock was taken for; empty when none.
    const std::string& Path() const noexcept { return path_; }
    // A descriptor of the new file FD that a save is about to rename over PATH, locked now
    // (nobody else knows the file yet); it becomes the lock once Adopt is called. -1 on failure.
    static int LockNewFile(int fd) noexcept;
    // The save put the file of LOCKEDFD (from LockNewFile) in place of PATH: the lock moves to
    // it, and the replaced file's lock is let go, waking waiters to read the new file.
    void Adopt(const std::string& path, int lockedFd);
    void Release() noexcept;

private:
    std::string path_;
    std::shared_ptr<LockedProjectFile> file_;
};

} // namespace wbhost::project
