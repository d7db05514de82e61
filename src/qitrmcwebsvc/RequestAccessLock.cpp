#include "qitrmcwebsvc/RequestAccessLock.h"

namespace nQITRMCWEBSVC100 {

void RequestAccessLock::lockShared() {
    std::unique_lock<std::mutex> hold(mutex);
    while (writers > 0) {
        readersCondition.wait(hold);
    }
    ++readers;
}

void RequestAccessLock::lockExclusive() {
    std::unique_lock<std::mutex> hold(mutex);
    ++writers;
    // Waits once without checking the condition again, so that a batch does not have to wait for
    // the slowest of the earlier requests. Shared holders may remain.
    if (writers > 1 || readers > 0) {
        writersCondition.wait(hold);
    }
}

void RequestAccessLock::unlockShared() {
    std::lock_guard<std::mutex> hold(mutex);
    --readers;
    wakeWaiters();
}

void RequestAccessLock::unlockExclusive() {
    std::lock_guard<std::mutex> hold(mutex);
    --writers;
    wakeWaiters();
}

void RequestAccessLock::wakeWaiters() {
    if (writers > 0) {
        writersCondition.notify_one();
    } else {
        readersCondition.notify_all();
    }
}

}  // namespace nQITRMCWEBSVC100
