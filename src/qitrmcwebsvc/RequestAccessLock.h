#pragma once

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <mutex>

namespace nQITRMCWEBSVC100 {

// Determines which requests may run concurrently: single requests hold the lock shared, a batch
// holds it exclusively. The lock protects no data.
//
// An exclusive caller that holds the lock or waits for it keeps later shared callers waiting. It
// waits once and then acquires the lock without checking the state again, so it may start while
// earlier shared holders are still running. Not recursive. Every operation may throw
// std::system_error; the mutex is then released.
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
    // The parts of the number of holders. Neither the requests nor the batches under way at the
    // same time come near 65,536: each has a thread.
    static constexpr std::uint32_t reader = 1;        // a shared holder
    static constexpr std::uint32_t writer = 1 << 16;  // an exclusive holder or waiting caller

    bool addReader() noexcept;

    std::condition_variable readersCondition;
    std::condition_variable writersCondition;
    std::atomic<std::uint32_t> holders{0};  // a shared caller needs nothing else without a writer
    std::mutex mutex;                       // held only inside the four operations
};

// Holds the lock shared during its lifetime.
class SharedAccess {
  public:
    explicit SharedAccess(RequestAccessLock& accessLock) : lock(accessLock) { lock.lockShared(); }
    ~SharedAccess() { lock.unlockShared(); }
    SharedAccess(const SharedAccess&) = delete;
    SharedAccess& operator=(const SharedAccess&) = delete;

  private:
    RequestAccessLock& lock;
};

// Holds the lock exclusively during its lifetime.
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
