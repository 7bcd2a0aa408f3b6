// Locks of the framework: the abstract CqvSyncObject and the critical section CqvCS.
#pragma once

#include <cstdint>
#include <mutex>

namespace Bytefair {

// An abstract lock. Lock waits at most timeoutMs milliseconds (where the lock honours it) and
// answers true when the lock is held.
class CqvSyncObject {
public:
    virtual ~CqvSyncObject() = default;
    // Sets the object's flag, kept for derived locks; CqvCS does not read it.
    virtual void SetFlag(bool value) noexcept { flag_ = value; }
    // Takes the lock; true when it is held.
    virtual bool Lock(uint32_t timeoutMs) = 0;
    // Releases a lock taken by Lock.
    virtual bool Unlock() = 0;

    // The flag set by SetFlag (false initially).
    bool Flag() const noexcept { return flag_; }

private:
    bool flag_ = false;
};

// A critical section: Lock waits as long as it takes (the timeout is not used) and always
// answers true. The thread that holds it may take it again; it is free once every Lock has been
// matched by an Unlock. lock()/unlock() let std::lock_guard and std::scoped_lock hold it.
class CqvCS : public CqvSyncObject {
public:
    CqvCS() = default;
    CqvCS(const CqvCS&) = delete;
    CqvCS& operator=(const CqvCS&) = delete;

    bool Lock(uint32_t timeoutMs = 0xFFFFFFFFu) override;
    bool Unlock() override;

    // Lock() under the name std::lock_guard looks for.
    void lock() { Lock(); }
    // Unlock() under the name std::lock_guard looks for.
    void unlock() { Unlock(); }

private:
    // Recursive, because a critical section is: code holding the provider lock may reach code
    // that takes it again on the same thread.
    std::recursive_mutex mutex_;
};

} // namespace Bytefair
