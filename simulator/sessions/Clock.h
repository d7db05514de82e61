#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>

#include "common/ThreadShares.h"
#include "description/Environment.h"

namespace simulator {

// The simulated time. Needs the simulator's mutex to be held, except for noteCall()
// and calls() where time does not go by calls.
class Clock {
  public:
    explicit Clock(const TimeScale& scale) : scale(scale) {}

    // Microseconds since the chassis was loaded. The time never goes back; it stays at
    // the largest number once that is reached, at the largest scale after 106 days.
    std::int64_t now() const;
    // A call of the driver begins: by calls, a millisecond has passed.
    void noteCall();
    // How many calls have begun.
    std::uint64_t calls() const;

    // Whether what takes time is over at once, with the clock moved on by skip().
    bool goesByCalls() const { return scale.byCalls; }
    // Lets simulated seconds pass, 0 to a day.
    void skip(double seconds);
    // How long simulated seconds, 0 to a day, take in reality.
    std::chrono::nanoseconds realTime(double seconds) const;

  private:
    using Real = std::chrono::steady_clock;

    TimeScale scale;
    Real::time_point start = Real::now();
    // By calls, the time itself in microseconds.
    std::int64_t stepped = 0;
    common::ThreadShares<std::atomic<std::uint64_t>> begun;
};

}  // namespace simulator
