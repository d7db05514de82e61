#pragma once

#include <mutex>
#include <new>
#include <string_view>

#include "Api.h"
#include "entries/StatusFiller.h"
#include "entries/WatchedCall.h"
#include "sessions/Simulator.h"
#include "status/Refusal.h"
#include "trace/Call.h"

// What stands between C callers and the simulator. No exception gets past it.
namespace simulator {

// Runs body(simulator, lock) with the mutex held, unless the status is negative already. What body
// throws ends up in the status. describe() makes the Call for those who watch calls; it is not run
// when nobody does.
template <typename Describe, typename Body>
void withSimulator(qierr_Status* status, Describe describe, Body body) noexcept {
    if (status->code < 0) {
        return;
    }
    try {
        Simulator& simulator = Simulator::instance();
        const auto act = [&](std::unique_lock<std::mutex>& lock) { body(simulator, lock); };
        if (!simulator.isWatched()) {
            std::unique_lock<std::mutex> lock(simulator.mutex);
            simulator.clock.noteCall();
            act(lock);
            return;
        }
        WatchedCall(simulator, describe(), *status).run(act);
    } catch (...) {
        reportCurrentException(*status);
    }
}

// Sets what a function gives out to 0 or null, unless the status keeps it from acting.
template <typename... Outs>
void clearOutputs(const qierr_Status* status, Outs*... outs) noexcept {
    if (status->code >= 0) {
        ((*outs = Outs{}), ...);
    }
}

// Runs body(simulator, session) in the same way, for an open session.
template <typename Describe, typename Body>
void withSession(nQITRMCAPI100_Session session, qierr_Status* status, Describe describe,
                 Body body) noexcept {
    withSimulator(status, describe, [&](Simulator& simulator, std::unique_lock<std::mutex>&) {
        body(simulator, simulator.sessions.get(session));
    });
}

// A text that a caller must give. Refuses a null pointer with the argument's name.
std::string_view required(const char* text, const char* argument);

}  // namespace simulator
