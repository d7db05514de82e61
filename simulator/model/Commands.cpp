#include "model/Commands.h"

#include <type_traits>
#include <utility>

#include "model/Chassis.h"

namespace simulator {

namespace {

double sum(double left, double right) {
    return left + right;
}

// Integers wrap around.
template <typename Integer>
Integer sum(Integer left, Integer right) {
    using Unsigned = std::make_unsigned_t<Integer>;
    return static_cast<Integer>(
        static_cast<Unsigned>(static_cast<Unsigned>(left) + static_cast<Unsigned>(right)));
}

void addNumber(Elements& value, const Elements& added) {
    std::visit(
        [&](auto& list) {
            using Items = std::decay_t<decltype(list)>;
            if constexpr (!std::is_same_v<Items, List<std::string>>) {
                list.front() = sum(list.front(), std::get<Items>(added).front());
            }
        },
        value);
}

}  // namespace

PropertyChanges::Change& PropertyChanges::of(const Resource& owner, Property& property) {
    return changes.try_emplace(&property, Change{&owner, std::nullopt, false}).first->second;
}

void PropertyChanges::addReset(Resource& resource) {
    resource.properties.forEach([&](Property& property) {
        Change& change = of(resource, property);
        change.dropsPending = true;
        if (!property.definition->lasting) {
            change.value = property.initial;
        }
    });
}

void PropertyChanges::add(const Command& command, Resource& resource) {
    if (command.resets) {
        addReset(resource);
    }
    for (const CommandEffect& effect : command.effects) {
        Resource& owner =
            effect.owner == CommandEffect::Owner::Device ? *resource.device : resource;
        Property& property = *owner.properties.find(effect.property);
        Change& change = of(owner, property);
        if (effect.action == CommandEffect::Action::Set) {
            change.value = effect.value;
            continue;
        }
        if (!change.value) {
            change.value = property.value;
        }
        addNumber(*change.value, effect.value);
        property.definition->limit(*change.value);
    }
}

void PropertyChanges::carryOut() noexcept {
    for (auto& [property, change] : changes) {
        if (change.value) {
            property->value = std::move(*change.value);
        }
        if (change.dropsPending) {
            property->pending.reset();
        }
    }
}

}  // namespace simulator
