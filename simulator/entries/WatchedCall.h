#pragma once

#include <chrono>
#include <mutex>

#include "entries/StatusFiller.h"
#include "sessions/Simulator.h"
#include "trace/Call.h"

namespace simulator {

// One call while somebody watches: it goes into the trace with its outcome.
class WatchedCall {
  public:
    WatchedCall(Simulator& simulator, const Call& call, qierr_Status& status)
        : simulator(simulator), call(call), status(status) {}

    // Runs body(lock) with the simulator's mutex held. What it throws ends up in the status.
    template <typename Body>
    void run(Body body) noexcept {
        const auto start = std::chrono::steady_clock::now();
        try {
            std::unique_lock<std::mutex> lock(simulator.mutex);
            body(lock);
        } catch (...) {
            reportCurrentException(status);
        }
        if (simulator.trace.isOn()) {
            simulator.trace.note(call, status, start);
        }
    }

  private:
    Simulator& simulator;
    const Call call;
    qierr_Status& status;
};

}  // namespace simulator
