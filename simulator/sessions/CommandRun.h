#pragma once

#include <vector>

#include "sessions/Simulator.h"

namespace simulator {

// A command that is to be carried out on a resource.
struct Task {
    Resource* resource;
    Command* command;
};

// Makes sure that a session may let this resource carry out a command now. Refuses with
// resourceBusy, and like Reservations::expectWritable.
void expectReady(const Resource& resource, const Simulator& simulator,
                 nQITRMCAPI100_Session session);

// Completes commands whose time has passed. Each takes effect, unless one of them fails: then none
// does, and the first failure is thrown. Returns the first warning, owned by its command, or null.
const Refusal* finish(const std::vector<Task>& tasks, Simulator& simulator);

}  // namespace simulator
