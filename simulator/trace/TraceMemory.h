#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <deque>
#include <mutex>
#include <string>
#include <vector>

namespace simulator {

// The latest lines of the trace, for those who follow it without a file. Lines are kept from the
// first read until ten seconds after the last one. All functions may be called from any thread.
class TraceMemory {
  public:
    struct Lines {
        std::vector<std::string> lines;
        std::uint64_t next = 0;  // the number of the first line that is not there yet
    };

    // Whether lines are kept at the moment.
    bool isOn() const noexcept { return on.load(std::memory_order_relaxed); }

    // Does nothing when lines are not kept. Throws std::bad_alloc.
    void keep(const std::string& line);

    // The lines that are kept, from a number on. Lines are numbered from 0; a number that is not
    // there yet means the oldest line.
    Lines read(std::uint64_t from);

  private:
    using Clock = std::chrono::steady_clock;

    std::atomic<bool> on{false};
    std::mutex mutex;
    Clock::time_point lastRead;
    std::uint64_t first = 0;  // the number of the oldest line
    std::deque<std::string> kept;
};

}  // namespace simulator
