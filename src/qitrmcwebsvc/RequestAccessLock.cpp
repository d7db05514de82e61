#include "qitrmcwebsvc/RequestAccessLock.h"

namespace nQITRMCWEBSVC100 {

void RequestAccessLock::lockShared() {
    std::unique_lock<std::mutex> hold(mutex);
    while (writers > 0)
        readersCondition.wait(hold);
    ++readers;
}

void RequestAccessLock::lockExclusive() {
    std::unique_lock<std::mutex> hold(mutex);
    ++writers;
    // One wait without a second test: whoever is woken is let in, beside a remaining shared holder
    // too. That keeps a batch from waiting for the slowest of the requests that were there first.
    if (writers > 1 || readers > 0)
        writersCondition.wait(hold);
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
    if (writers > 0)
        writersCondition.notify_one();
    else
        readersCondition.notify_all();
}

}  // namespace nQITRMCWEBSVC100
