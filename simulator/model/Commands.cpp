#include "model/Commands.h"

#include <type_traits>

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

void carryOut(const Command& command, PropertyStore& properties) {
    if (command.resets) {
        properties.reset();
    }
    for (const CommandEffect& effect : command.effects) {
        Property& property = *properties.find(effect.property);
        if (effect.action == CommandEffect::Action::add) {
            addNumber(property.value, effect.value);
        } else {
            property.value = effect.value;
        }
    }
}

}  // namespace simulator
