#pragma once

#include <shared_mutex>
#include <string_view>

#include "Api.h"
#include "entries/Driver.h"
#include "entries/StatusFiller.h"
#include "entries/WatchedCall.h"
#include "sessions/Simulator.h"
#include "status/Refusal.h"
#include "trace/Call.h"

// What all exported functions do around their work. No exception leaves these functions.
namespace simulator {

// Runs body(simulator, lock) with the mutex locked, unless the status is negative already. An
// exception of the body ends up in the status. describe() creates the Call for traces and faults;
// it is not called when there are none.
template <typename Describe, typename Body>
void withSimulator(qierr_Status* status, Describe describe, Body body) noexcept {
    if (status->code < 0) {
        return;
    }
    try {
        Driver& driver = Driver::instance();
        Simulator& simulator = driver.simulator;
        const auto act = [&](WriteLock& lock) { body(simulator, lock); };
        if (!driver.isWatched()) {
            WriteLock lock(simulator.mutex);
            simulator.clock.noteCall();
            act(lock);
            return;
        }
        WatchedCall(driver, describe(), *status).run(act);
    } catch (...) {
        reportCurrentException(*status);
    }
}

// The same for a body that only reads, body(simulator): calls of several threads run at the same
// time. A call that may be delayed or that moves the clock on is not shared.
template <typename Describe, typename Body>
void withSharedSimulator(qierr_Status* status, Describe describe, Body body) noexcept {
    if (status->code < 0) {
        return;
    }
    try {
        Driver& driver = Driver::instance();
        Simulator& simulator = driver.simulator;
        if (!driver.isWatched() && !simulator.clock.goesByCalls()) {
            const std::shared_lock<SharedMutex> lock(simulator.mutex);
            simulator.clock.noteCall();
            body(simulator);
            return;
        }
    } catch (...) {
        reportCurrentException(*status);
        return;
    }
    withSimulator(status, describe, [&](Simulator& simulator, WriteLock&) { body(simulator); });
}

// Runs body(simulator, session) as withSimulator does, for an open session.
template <typename Describe, typename Body>
void withSession(nQITRMCAPI100_Session session, qierr_Status* status, Describe describe,
                 Body body) noexcept {
    withSimulator(status, describe, [&](Simulator& simulator, WriteLock&) {
        body(simulator, simulator.sessions.get(session));
    });
}

// The same as withSharedSimulator does.
template <typename Describe, typename Body>
void withSharedSession(nQITRMCAPI100_Session session, qierr_Status* status, Describe describe,
                       Body body) noexcept {
    withSharedSimulator(status, describe, [&](Simulator& simulator) {
        body(simulator, simulator.sessions.get(session));
    });
}

// Sets the outputs of a function to 0 or null, unless the status is negative already.
template <typename... Outputs>
void clearOutputs(const qierr_Status* status, Outputs*... outputs) noexcept {
    if (status->code >= 0) {
        ((*outputs = Outputs{}), ...);
    }
}

// A text that a caller must give. Refuses a null pointer with the argument's name.
std::string_view required(const char* text, const char* argument);

}  // namespace simulator
