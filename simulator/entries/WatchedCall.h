#pragma once

#include <chrono>
#include <exception>

#include "entries/Driver.h"
#include "entries/StatusFiller.h"
#include "faults/MatchedFault.h"
#include "trace/Call.h"

namespace simulator {

// One call while there is a trace or a fault: a fault may apply to it, and it is traced with its
// outcome.
class WatchedCall {
  public:
    WatchedCall(Driver& driver, const Call& call, qierr_Status& status)
        : driver(driver), call(call), status(status) {}

    // Runs body(lock) with the simulator's mutex locked. An exception ends up in the status.
    template <typename Body>
    void run(Body body) noexcept {
        const auto start = std::chrono::steady_clock::now();
        try {
            WriteLock lock(driver.simulator.mutex);
            driver.simulator.clock.noteCall();
            driver.faults.refresh();
            const MatchedFault fault(driver.simulator, driver.faults, call);
            fault.applyBefore(lock);
            const std::exception_ptr warning = warningOf(body, lock);
            fault.applyAfter();
            if (warning != nullptr) {
                std::rethrow_exception(warning);
            }
        } catch (...) {
            reportCurrentException(status);
        }
        if (driver.trace.isOn()) {
            driver.trace.note(call, status, start);
        }
    }

  private:
    // Runs the body. Returns the exception of a warning; that of a failure is thrown on.
    template <typename Body>
    static std::exception_ptr warningOf(Body body, WriteLock& lock) {
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

    Driver& driver;
    const Call call;
    qierr_Status& status;
};

}  // namespace simulator
