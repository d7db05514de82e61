#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <mutex>

namespace host {

// Counts the requests in flight, and lets no more in once it is shut. All functions may be called
// from any thread.
class Gate {
  public:
    // Lets a request in; false once the gate is shut.
    bool enter() {
        const std::lock_guard<std::mutex> lock(mutex);
        inFlight += shut ? 0 : 1;
        return !shut;
    }

    // The end of a request that was let in.
    void leave() {
        const std::lock_guard<std::mutex> lock(mutex);
        if (--inFlight == 0) {
            empty.notify_all();
        }
    }

    void close() {
        const std::lock_guard<std::mutex> lock(mutex);
        shut = true;
    }

    bool isClosed() {
        const std::lock_guard<std::mutex> lock(mutex);
        return shut;
    }

    // Waits until no request is in flight; false when the time runs out before that.
    bool waitUntilEmpty(std::chrono::milliseconds time) {
        std::unique_lock<std::mutex> lock(mutex);
        return empty.wait_for(lock, time, [this] { return inFlight == 0; });
    }

  private:
    std::mutex mutex;
    std::condition_variable empty;
    std::uint32_t inFlight = 0;
    bool shut = false;
};

}  // namespace host
