#pragma once

#include <memory>

#include "live/Motions.h"
#include "model/Chassis.h"
#include "sessions/Clock.h"
#include "sessions/HandleTable.h"
#include "sessions/Reservations.h"
#include "sessions/Resolver.h"
#include "sessions/Sessions.h"
#include "sessions/SharedMutex.h"
#include "sessions/Waits.h"
#include "state/LastingState.h"

namespace simulator {

// A property that a session has opened to read its attributes.
struct OpenProperty {
    nQITRMCAPI100_Session session;
    const PropertyDefinition* definition;
    // Null when the property was opened without a resource.
    const Resource* resource;
};

// A command that a session has opened to read its attributes.
struct OpenCommand {
    nQITRMCAPI100_Session session;
    const Command* command;
};

// The chassis together with the state of all its users. Its parts are guarded by one mutex. Calls
// that only read hold it together; all others hold it alone, and release it while they wait.
struct Simulator {
    // Restores the lasting state of the chassis.
    Simulator(std::unique_ptr<Chassis> loaded, Motions motions, const TimeScale& timeScale);

    Resolver resolver(const Session& session) const {
        return Resolver(*chassis, reservations, session);
    }

    // Puts a device into its state after power-on, except for what lasts.
    void reset(Device& device);
    // Closes a session with all that it has.
    void close(nQITRMCAPI100_Session session);

    SharedMutex mutex;
    const std::unique_ptr<Chassis> chassis;
    Motions motions;
    LastingState lasting;
    Clock clock;
    Waits waits;
    Sessions sessions;
    Reservations reservations;
    // These have mutexes of their own: opening and closing do not change the chassis.
    GuardedHandleTable<OpenProperty> openProperties;
    GuardedHandleTable<OpenCommand> openCommands;
};

}  // namespace simulator
