#include "sessions/Simulator.h"

namespace simulator {

Simulator::Simulator(std::unique_ptr<Chassis> loaded, Motions motions, const TimeScale& timeScale)
    : chassis(std::move(loaded)),
      motions(std::move(motions)),
      lasting(*chassis),
      clock(timeScale),
      waits(clock),
      sessions(chassis->firstSessionHandle, chassis->sessionProperties, lasting),
      reservations(*chassis, waits) {}

void Simulator::reset(Device& device) {
    device.reset();
    const std::int64_t now = clock.now();
    device.forEachResource([&](const Resource& resource) { motions.restart(resource, now); });
}

void Simulator::close(nQITRMCAPI100_Session session) {
    const auto isOfSession = [&](const auto& item) { return item.session == session; };
    waits.endAll(session, Wait::End::Closed);
    reservations.releaseAll(session);
    openProperties.removeIf(isOfSession);
    openCommands.removeIf(isOfSession);
    if (const Session* closing = sessions.find(session)) {
        for (Device* device : closing->writtenDevices) {
            device->dropPending(session);
        }
    }
    sessions.remove(session);
}

}  // namespace simulator
