#include "model/Commands.h"

#include <type_traits>
#include <utility>

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

PropertyChanges::Change& PropertyChanges::of(Property& property) {
    const auto found = changes.find(&property);
    return found != changes.end()
               ? found->second
               : changes.emplace(&property, Change{property.value, false}).first->second;
}

void PropertyChanges::add(const Command& command, PropertyStore& own, PropertyStore& device) {
    if (command.resets) {
        own.forEach([&](Property& property) {
            Change& change = of(property);
            change.value = property.initial;
            change.dropsPending = true;
        });
    }
    for (const CommandEffect& effect : command.effects) {
        PropertyStore& store = effect.owner == CommandEffect::Owner::device ? device : own;
        Change& change = of(*store.find(effect.property));
        if (effect.action == CommandEffect::Action::add) {
            addNumber(change.value, effect.value);
        } else {
            change.value = effect.value;
        }
    }
}

void PropertyChanges::carryOut() noexcept {
    for (auto& [property, change] : changes) {
        property->value = std::move(change.value);
        if (change.dropsPending) {
            property->pending.reset();
        }
    }
}

}  // namespace simulator
