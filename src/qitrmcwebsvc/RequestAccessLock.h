#pragma once

#include <condition_variable>
#include <cstdint>
#include <mutex>

namespace nQITRMCWEBSVC100 {

// Decides which requests may overlap: single requests hold it shared, a batch exclusive. It guards
// no data.
//
// A shared caller counts once it is in; an exclusive caller counts from its arrival, which bars
// shared callers that come later. An exclusive caller waits once and is let in by whatever wakes
// it, so it may start while a shared holder that was there first is still running. Not recursive.
// Every operation may throw std::system_error and then has released the mutex.
class RequestAccessLock {
  public:
    RequestAccessLock() = default;
    virtual ~RequestAccessLock() = default;
    RequestAccessLock(const RequestAccessLock&) = delete;
    RequestAccessLock& operator=(const RequestAccessLock&) = delete;

    void lockShared();
    void unlockShared();
    void lockExclusive();
    void unlockExclusive();

  private:
    void wakeWaiters();

    std::condition_variable readersCondition;
    std::condition_variable writersCondition;
    std::int32_t readers = 0;  // holders
    std::int32_t writers = 0;  // waiting callers and the holder
    std::mutex mutex;          // held inside the four operations only
};

// Holds the lock shared for its own life.
class SharedAccess {
  public:
    explicit SharedAccess(RequestAccessLock& accessLock) : lock(accessLock) { lock.lockShared(); }
    ~SharedAccess() { lock.unlockShared(); }
    SharedAccess(const SharedAccess&) = delete;
    SharedAccess& operator=(const SharedAccess&) = delete;

  private:
    RequestAccessLock& lock;
};

// Holds the lock exclusive for its own life.
class ExclusiveAccess {
  public:
    explicit ExclusiveAccess(RequestAccessLock& accessLock) : lock(accessLock) {
        lock.lockExclusive();
    }
    ~ExclusiveAccess() { lock.unlockExclusive(); }
    ExclusiveAccess(const ExclusiveAccess&) = delete;
    ExclusiveAccess& operator=(const ExclusiveAccess&) = delete;

  private:
    RequestAccessLock& lock;
};

}  // namespace nQITRMCWEBSVC100
