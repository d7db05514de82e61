#pragma once

#include <chrono>

#include "trace/Call.h"
#include "trace/TraceMemory.h"

namespace simulator {

// Writes a line about each call of the driver, in the order in which the calls end. The lines of
// threads do not mix. A line that cannot be written is left out: a trace fails no call.
class Trace {
  public:
    using Time = std::chrono::steady_clock::time_point;

    // Writes to the file that QITRMC_SIM_TRACE names, behind what is there; "-" is standard error.
    // Without the variable the trace is off. Refuses with chassisNotLoaded when the file cannot
    // be opened.
    Trace();
    Trace(const Trace&) = delete;
    Trace& operator=(const Trace&) = delete;
    ~Trace();

    bool isOn() const { return file >= 0 || latest.isOn(); }
    // Notes a call that began at a time and has ended now.
    void note(const Call& call, const qierr_Status& status, Time begin) noexcept;

    // The same lines, without their ends.
    TraceMemory latest;

  private:
    void writeLine(const std::string& line) const;

    const Time start;
    const int file;
};

}  // namespace simulator
