#pragma once

#include <pthread.h>

#include <mutex>

namespace simulator {

// A mutex that many threads may hold at once for reading, or one for writing. Unlike
// std::shared_mutex, whose preference is not specified, it lets waiting writers go before new
// readers: clients that read without a pause cannot keep a writer waiting for ever. A thread must
// not lock it twice, not even for reading.
class SharedMutex {
  public:
    SharedMutex() {
        pthread_rwlockattr_t attributes;
        pthread_rwlockattr_init(&attributes);
        pthread_rwlockattr_setkind_np(&attributes, PTHREAD_RWLOCK_PREFER_WRITER_NONRECURSIVE_NP);
        pthread_rwlock_init(&rwlock, &attributes);
        pthread_rwlockattr_destroy(&attributes);
    }
    SharedMutex(const SharedMutex&) = delete;
    SharedMutex& operator=(const SharedMutex&) = delete;
    ~SharedMutex() { pthread_rwlock_destroy(&rwlock); }

    // The names that std::unique_lock and std::shared_lock need.
    void lock() { pthread_rwlock_wrlock(&rwlock); }
    void unlock() { pthread_rwlock_unlock(&rwlock); }
    void lock_shared() { pthread_rwlock_rdlock(&rwlock); }
    void unlock_shared() { pthread_rwlock_unlock(&rwlock); }

  private:
    pthread_rwlock_t rwlock;
};

// What a call holds that changes anything, and unlocks while it waits.
using WriteLock = std::unique_lock<SharedMutex>;

}  // namespace simulator
