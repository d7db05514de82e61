#pragma once

#include <string>
#include <vector>

#include "model/Properties.h"

namespace simulator {

// What a command does to one property of its resource when it is through.
struct CommandEffect {
    enum class Action { set, add };

    Action action;
    std::string property;
    // The new value, or one number to be added to a scalar.
    Elements value;
};

struct Command {
    std::string name;
    std::string description;
    std::string document;
    // How long it takes.
    double seconds = 0.0;
    // Puts the properties of the resource into their state after power-on first.
    bool resets = false;
    std::vector<CommandEffect> effects;
};

// Does to the properties of a resource what the command is for.
void carryOut(const Command& command, PropertyStore& properties);

}  // namespace simulator
