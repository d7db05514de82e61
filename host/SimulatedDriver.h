#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace host {

// A function of the driver that the plug-in has loaded; null when there is none of that name.
void* driverFunction(const char* name);

// All that follow do nothing when the plug-in has loaded another driver than the simulated one.

// Starts the simulated driver and returns what it says of its chassis. Throws Failure when the
// chassis cannot be loaded.
std::string startSimulatedDriver();

// What the plug-in has not given back to the simulated driver, in one line; empty when there is
// nothing. Sessions do not count: clients may leave them open.
std::string thingsNotGivenBack();

// The calls of the simulated driver so far; nothing with another driver.
std::optional<std::uint64_t> countDriverCalls();

}  // namespace host
