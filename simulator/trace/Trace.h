#pragma once

#include <chrono>

#include "trace/Call.h"
#include "trace/TraceMemory.h"

namespace simulator {

// Writes a line about each call of the driver, in the order in which the calls end. The lines of
// threads do not mix. A line that cannot be written is lost, without an effect on the call.
class Trace {
  public:
    using Time = std::chrono::steady_clock::time_point;

    // Appends to the file that QITRMC_SIM_TRACE names; "-" is standard error.
    // Without the variable the trace is off. Refuses with chassisNotLoaded when the file cannot
    // be opened.
    Trace();
    Trace(const Trace&) = delete;
    Trace& operator=(const Trace&) = delete;
    ~Trace();

    bool isOn() const { return file >= 0 || latest.isOn(); }
    // Writes the line of a call that began at `begin` and has ended now.
    void note(const Call& call, const qierr_Status& status, Time begin) noexcept;

    // The same lines, without their ends.
    TraceMemory latest;

  private:
    void writeLine(const std::string& line) const;

    const Time start;
    const int file;
};

}  // namespace simulator
