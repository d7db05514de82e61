#include "sessions/Clock.h"

#include <algorithm>
#include <cmath>

namespace simulator {

namespace {

constexpr std::int64_t callStep = 1000;
// A double has this number, and the next one is out of range.
constexpr double latest = 9223372036854774784.0;

}  // namespace

std::int64_t Clock::now() const {
    if (scale.byCalls) {
        return stepped;
    }
    const std::chrono::duration<double, std::micro> passed = Real::now() - start;
    return static_cast<std::int64_t>(std::min(passed.count() * scale.factor, latest));
}

void Clock::noteCall() {
    begun.own().fetch_add(1, std::memory_order_relaxed);
    if (scale.byCalls) {
        stepped += callStep;
    }
}

std::uint64_t Clock::calls() const {
    std::uint64_t sum = 0;
    begun.forEach([&](const std::atomic<std::uint64_t>& some) { sum += some.load(); });
    return sum;
}

void Clock::skip(double seconds) {
    stepped += std::llround(seconds * 1e6);
}

std::chrono::nanoseconds Clock::realTime(double seconds) const {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
        std::chrono::duration<double>(seconds / scale.factor));
}

}  // namespace simulator
