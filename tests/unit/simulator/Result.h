// The result of a call in another thread.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <future>
#include <thread>

namespace drivertest {

using Result = std::future<std::int32_t>;

inline bool isReady(const Result& result) {
    return result.wait_for(std::chrono::seconds(0)) == std::future_status::ready;
}

// Calls `act` repeatedly until the call that it is meant for has returned.
inline std::int32_t resultAfter(Result& result, const std::function<void()>& act) {
    while (!isReady(result)) {
        act();
        std::this_thread::yield();
    }
    return result.get();
}

}  // namespace drivertest
