#include "sessions/CommandRun.h"

#include "live/Maths.h"

namespace simulator {

namespace {

bool isInState(const Resource& resource, const CommandFailure::State& state,
               const Simulator& simulator) {
    const Property& property = *resource.properties.find(state.property);
    return simulator.motions.valueAt(property, simulator.clock.now()) == state.value;
}

// A random number from 0 to below 1, the same in every run for the same seed, command and number
// of executions.
double chance(std::uint64_t seed, std::uint64_t command, std::uint64_t executions) {
    return uniform(mixed(mixed(mixed(seed) + command) + executions));
}

// The status with which a command ends, or null.
const Refusal* outcome(const Task& task, const Simulator& simulator) {
    const Command& command = *task.command;
    const std::uint64_t number = command.executions + 1;
    if (!command.fails || number % command.fails->every != 0 ||
        chance(simulator.motions.seed, command.number, number) >= command.fails->probability) {
        return nullptr;
    }
    const auto& when = command.fails->when;
    const bool happens = !when || isInState(*task.resource, *when, simulator);
    return happens ? &command.fails->status : nullptr;
}

// Updates the values that follow changed properties.
void noteOutcome(const Task& task, Simulator& simulator) noexcept {
    Motions& motions = simulator.motions;
    const std::int64_t now = simulator.clock.now();
    if (task.command->resets) {
        motions.restart(*task.resource, now);
    } else {
        motions.noteChange(*task.resource, now);
    }
    if (task.resource != task.resource->device) {
        motions.noteChange(*task.resource->device, now);
    }
}

void keep(const PropertyChanges& changes, LastingState& lasting) {
    Change change = lasting.change();
    changes.forEachValue(
        [&](const Resource& owner, const PropertyDefinition& definition, const Elements& value) {
            change.property(&owner, definition, value);
        });
    lasting.keep(change);
}

void countExecutions(const std::vector<Task>& tasks) noexcept {
    for (const Task& task : tasks) {
        ++task.command->executions;
    }
}

}  // namespace

void expectReady(const Resource& resource, const Simulator& simulator,
                 nQITRMCAPI100_Session session) {
    simulator.reservations.expectWritable(session, *resource.device);
    if (resource.busy) {
        throw Refusal(code::resourceBusy).usage(tag::resource, resource.fullName());
    }
}

const Refusal* finish(const std::vector<Task>& tasks, Simulator& simulator) {
    PropertyChanges changes;
    const Refusal* warning = nullptr;
    for (const Task& task : tasks) {
        const Refusal* status = outcome(task, simulator);
        if (status != nullptr && status->code() < 0) {
            Refusal failure = *status;
            countExecutions(tasks);
            throw failure;
        }
        warning = warning != nullptr ? warning : status;
        changes.add(*task.command, *task.resource);
    }
    keep(changes, simulator.lasting);
    countExecutions(tasks);
    changes.carryOut();
    for (const Task& task : tasks) {
        noteOutcome(task, simulator);
    }
    return warning;
}

}  // namespace simulator
