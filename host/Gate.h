#pragma once

#include <atomic>
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
        if ((state.fetch_add(one) & shut) == 0) {
            return true;
        }
        leave();
        return false;
    }

    // The end of a request that was let in.
    void leave() {
        if (state.fetch_sub(one) != (shut | one)) {
            return;
        }
        const std::lock_guard<std::mutex> lock(mutex);
        empty.notify_all();
    }

    void close() { state |= shut; }

    bool isClosed() const { return (state & shut) != 0; }

    // Waits until no request is in flight; false when the time runs out before that. To be called
    // once the gate is shut.
    bool waitUntilEmpty(std::chrono::milliseconds time) {
        std::unique_lock<std::mutex> lock(mutex);
        return empty.wait_for(lock, time, [this] { return state < one; });
    }

  private:
    static constexpr std::uint32_t shut = 1;
    static constexpr std::uint32_t one = 2;

    std::atomic<std::uint32_t> state{0};  // shut once it is shut, and one for each request
    std::mutex mutex;
    std::condition_variable empty;
};

}  // namespace host
