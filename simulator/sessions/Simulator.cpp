#include "sessions/Simulator.h"

#include <optional>

#include "description/ChassisFile.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

// What the first use leaves behind: a simulator, or the reason why there is none.
struct Start {
    Start() {
        try {
            const Settings settings = readSettings();
            auto chassis = loadChassis();
            chassis->life.seed = settings.seed.value_or(chassis->life.seed);
            simulator.emplace(std::move(chassis), settings.timeScale);
        } catch (const Refusal& refusal) {
            failure = refusal;
        }
    }

    std::optional<Simulator> simulator;
    std::optional<Refusal> failure;
};

}  // namespace

Simulator& Simulator::instance() {
    static Start start;
    if (start.failure) {
        throw *start.failure;
    }
    return *start.simulator;
}

Simulator::Simulator(std::unique_ptr<Chassis> loaded, const TimeScale& timeScale)
    : chassis(std::move(loaded)),
      lasting(*chassis),
      clock(timeScale),
      waits(clock),
      sessions(chassis->firstSessionHandle, chassis->sessionProperties, lasting),
      reservations(*chassis, waits),
      faults(*chassis, sessions, waits, clock) {
    // What follows a value that was restored has followed it long ago.
    chassis->life.settle();
}

void Simulator::close(nQITRMCAPI100_Session session) {
    const auto isOfSession = [&](const auto& item) { return item.session == session; };
    waits.endAll(session, Wait::End::closed);
    reservations.releaseAll(session);
    openProperties.removeIf(isOfSession);
    openCommands.removeIf(isOfSession);
    for (const auto& device : chassis->devices()) {
        device->dropPending(session);
    }
    sessions.remove(session);
}

}  // namespace simulator
