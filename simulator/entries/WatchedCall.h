#pragma once

#include <chrono>
#include <exception>
#include <mutex>

#include "entries/StatusFiller.h"
#include "faults/Strike.h"
#include "sessions/Simulator.h"
#include "trace/Call.h"

namespace simulator {

// One call while somebody watches: a fault may strike it, and it goes into the trace with its
// outcome.
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
            simulator.clock.noteCall();
            simulator.faults.refresh();
            const Strike strike(simulator, call);
            strike.before(lock);
            const std::exception_ptr warning = warningOf(body, lock);
            strike.after();
            if (warning != nullptr) {
                std::rethrow_exception(warning);
            }
        } catch (...) {
            reportCurrentException(status);
        }
        if (simulator.trace.isOn()) {
            simulator.trace.note(call, status, start);
        }
    }

  private:
    // Runs the body. A warning comes back, a failure goes on.
    template <typename Body>
    static std::exception_ptr warningOf(Body body, std::unique_lock<std::mutex>& lock) {
        try {
            body(lock);
        } catch (const Refusal& refusal) {
            if (refusal.code() < 0) {
                throw;
            }
            return std::current_exception();
        }
        return nullptr;
    }

    Simulator& simulator;
    const Call call;
    qierr_Status& status;
};

}  // namespace simulator
