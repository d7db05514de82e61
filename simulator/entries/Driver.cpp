#include "entries/Driver.h"

#include <optional>
#include <utility>

#include "description/ChassisReader.h"
#include "description/Environment.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

Simulator makeSimulator() {
    const Settings settings = readSettings();
    DescribedChassis described = loadChassis();
    described.motions.seed = settings.seed.value_or(described.motions.seed);
    return {std::move(described.chassis), std::move(described.motions), settings.timeScale};
}

// The outcome of the first use: a driver, or the reason why there is none.
struct Start {
    Start() {
        try {
            driver.emplace();
        } catch (const Refusal& refusal) {
            failure = refusal;
        }
    }

    std::optional<Driver> driver;
    std::optional<Refusal> failure;
};

}  // namespace

Driver::Driver() : simulator(makeSimulator()), faults(simulator) {
    // What follows a restored value reached it long ago.
    simulator.motions.settle();
}

Driver& Driver::instance() {
    static Start start;
    if (start.failure) {
        throw *start.failure;
    }
    return *start.driver;
}

}  // namespace simulator
