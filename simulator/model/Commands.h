#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "model/Properties.h"
#include "status/Refusal.h"

namespace simulator {

struct Resource;

// What a command does to one property when it completes.
struct CommandEffect {
    enum class Action { Set, Add };
    // Whose property it is.
    enum class Owner { Resource, Device };

    Action action;
    Owner owner;
    std::string property;
    // The new value, or one number to be added to a scalar.
    Elements value;
};

// When a command ends with a status of its own. All of the conditions must hold.
struct CommandFailure {
    struct State {
        // A stored property of the resource, and the value it must have.
        std::string property;
        Elements value;
    };

    // A failure leaves the command without effect; a warning, with a code above 0, does not.
    Refusal status;
    std::optional<State> when{};
    double probability = 1.0;
    // Only executions whose number is a multiple of this, which is at least 1.
    std::uint32_t every = 1;
};

struct Command {
    std::string name;
    std::string description;
    std::string document;
    // How long it takes.
    double seconds = 0.0;
    // First resets the properties of the resource and discards what was not committed.
    bool resets = false;
    std::vector<CommandEffect> effects;
    std::optional<CommandFailure> fails;
    // A number that differs for each command of each resource, for the random decision to fail.
    std::uint64_t number = 0;
    // How often it was completed. A reset does not change it.
    std::uint64_t executions = 0;
};

// What commands are going to do to properties. Everything that may run out of memory is done
// during preparation. The properties must not move in memory.
class PropertyChanges {
  public:
    // Adds what a command does to the properties of its resource and of the resource's device, on
    // top of what was added before.
    void add(const Command& command, Resource& resource);
    // Adds a reset: the properties get their values after power-on, except for lasting ones, and
    // what was not committed is discarded.
    void addReset(Resource& resource);

    // Calls visit(const Resource&, const PropertyDefinition&, const Elements&) for each property
    // that gets a value.
    template <typename Visit>
    void forEachValue(Visit visit) const {
        for (const auto& [property, change] : changes) {
            if (change.value) {
                visit(*change.owner, *property->definition, *change.value);
            }
        }
    }

    void carryOut() noexcept;

  private:
    struct Change {
        const Resource* owner;
        std::optional<Elements> value;
        bool dropsPending = false;
    };

    Change& of(const Resource& owner, Property& property);

    std::map<Property*, Change> changes;
};

}  // namespace simulator
