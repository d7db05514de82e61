#include "Simulator.h"

#include <optional>

#include "ChassisFile.h"
#include "Refusal.h"

namespace simulator {

namespace {

// What the first use leaves behind: a simulator, or the reason why there is none.
struct Start {
    Start() {
        try {
            simulator.emplace(loadChassis(), loadCatalogue());
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

Simulator::Simulator(std::unique_ptr<Chassis> loaded, Catalogue catalogue)
    : chassis(std::move(loaded)),
      catalogue(std::move(catalogue)),
      sessions(chassis->firstSessionHandle),
      reservations(*chassis, waits) {}

}  // namespace simulator
