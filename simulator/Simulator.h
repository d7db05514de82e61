#pragma once

#include <memory>
#include <mutex>

#include "Catalogue.h"
#include "Chassis.h"
#include "Reservations.h"
#include "Resolver.h"
#include "Sessions.h"
#include "Waits.h"

namespace simulator {

// The chassis together with the state of all its users. There is one in the process, made at the
// first use. Its parts are guarded by one mutex, which calls that wait give up.
struct Simulator {
    Simulator(std::unique_ptr<Chassis> loaded, Catalogue catalogue);

    // The loaded simulator. Refuses with chassisNotLoaded when the chassis file is broken.
    static Simulator& instance();

    Resolver resolver(const Session& session) const {
        return Resolver(*chassis, reservations, session);
    }

    std::mutex mutex;
    const std::unique_ptr<Chassis> chassis;
    const Catalogue catalogue;
    Waits waits;
    Sessions sessions;
    Reservations reservations;
};

}  // namespace simulator
