#pragma once

#include <pthread.h>

#include <mutex>

#include "common/ThreadShares.h"

namespace simulator {

// A mutex that many threads may hold at once for reading, or one for writing. Unlike
// std::shared_mutex, whose preference is not specified, it lets waiting writers go before new
// readers: clients that read without a pause cannot keep a writer waiting for ever. A thread must
// not lock it twice, not even for reading, and unlocks it itself.
//
// It has several locks. A reader takes that of its thread, so that reading threads do not pass one
// counter of readers to and fro between their processors; a writer takes all of them.
class SharedMutex {
  public:
    // The names that std::unique_lock and std::shared_lock need.
    void lock() {
        locks.forEach([](Lock& lock) { pthread_rwlock_wrlock(&lock.rwlock); });
    }
    void unlock() {
        locks.forEach([](Lock& lock) { pthread_rwlock_unlock(&lock.rwlock); });
    }
    void lock_shared() { pthread_rwlock_rdlock(&locks.own().rwlock); }
    void unlock_shared() { pthread_rwlock_unlock(&locks.own().rwlock); }

  private:
    struct Lock {
        Lock() {
            pthread_rwlockattr_t attributes;
            pthread_rwlockattr_init(&attributes);
            pthread_rwlockattr_setkind_np(&attributes,
                                          PTHREAD_RWLOCK_PREFER_WRITER_NONRECURSIVE_NP);
            pthread_rwlock_init(&rwlock, &attributes);
            pthread_rwlockattr_destroy(&attributes);
        }
        Lock(const Lock&) = delete;
        Lock& operator=(const Lock&) = delete;
        ~Lock() { pthread_rwlock_destroy(&rwlock); }

        pthread_rwlock_t rwlock;
    };

    common::ThreadShares<Lock> locks;
};

// What a call holds that changes anything, and unlocks while it waits.
using WriteLock = std::unique_lock<SharedMutex>;

}  // namespace simulator
