#include "qitrmcwebsvc/RequestAccessLock.h"

namespace nQITRMCWEBSVC100 {

void RequestAccessLock::lockShared() {
    if (addReader()) {
        return;
    }
    std::unique_lock<std::mutex> hold(mutex);
    while (!addReader()) {
        readersCondition.wait(hold);
    }
}

void RequestAccessLock::lockExclusive() {
    std::unique_lock<std::mutex> hold(mutex);
    const std::uint32_t before = holders.fetch_add(writer);
    // Waits once without checking the condition again, so that a batch does not have to wait for
    // the slowest of the earlier requests. Shared holders may remain.
    if (before != 0) {
        writersCondition.wait(hold);
    }
}

void RequestAccessLock::unlockShared() {
    const std::uint32_t before = holders.fetch_sub(reader);
    if (before < writer) {
        return;
    }
    // With the mutex, as a writer that has counted itself might not wait yet.
    std::lock_guard<std::mutex> hold(mutex);
    writersCondition.notify_one();
}

void RequestAccessLock::unlockExclusive() {
    std::lock_guard<std::mutex> hold(mutex);
    const std::uint32_t before = holders.fetch_sub(writer);
    if (before >= 2 * writer) {
        writersCondition.notify_one();
    } else {
        readersCondition.notify_all();
    }
}

// Counts one more shared holder, unless there is a writer.
bool RequestAccessLock::addReader() noexcept {
    std::uint32_t seen = holders.load();
    while (seen < writer) {
        if (holders.compare_exchange_weak(seen, seen + reader)) {
            return true;
        }
    }
    return false;
}

}  // namespace nQITRMCWEBSVC100
