#pragma once

#include <memory>
#include <mutex>

#include "faults/Faults.h"
#include "model/Chassis.h"
#include "sessions/Clock.h"
#include "sessions/HandleTable.h"
#include "sessions/Reservations.h"
#include "sessions/Resolver.h"
#include "sessions/Sessions.h"
#include "sessions/Waits.h"
#include "state/LastingState.h"
#include "trace/Trace.h"

namespace simulator {

// A property that a session has opened to read its attributes.
struct OpenProperty {
    nQITRMCAPI100_Session session;
    Category category;
    DefinitionPointer definition;
    // Null when the property was opened without a resource.
    const Resource* resource;
};

// A command that a session has opened to read its attributes.
struct OpenCommand {
    nQITRMCAPI100_Session session;
    const Command* command;
};

// The chassis together with the state of all its users. There is one in the process, made at the
// first use. Its parts are guarded by one mutex, which calls that wait give up.
struct Simulator {
    // Puts what lasts into the chassis.
    Simulator(std::unique_ptr<Chassis> loaded, const TimeScale& timeScale);

    // The loaded simulator. Refuses with chassisNotLoaded when the chassis file is broken, and with
    // stateNotUsable when the state folder is, or when another process has it.
    static Simulator& instance();

    Resolver resolver(const Session& session) const {
        return Resolver(*chassis, reservations, session);
    }

    // Whether anybody wants to know of calls.
    bool isWatched() const { return trace.isOn() || faults.isOn(); }

    // Ends a session with all that it has.
    void close(nQITRMCAPI100_Session session);

    std::mutex mutex;
    const std::unique_ptr<Chassis> chassis;
    LastingState lasting;
    Trace trace;
    Clock clock;
    Waits waits;
    Sessions sessions;
    Reservations reservations;
    HandleTable<OpenProperty> openProperties;
    HandleTable<OpenCommand> openCommands;
    Faults faults;
};

}  // namespace simulator
