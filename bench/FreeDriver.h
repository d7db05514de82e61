#pragma once

#include <cstdint>

// Mod1 to Mod18.
constexpr std::uint32_t defaultDeviceCount = 18;

// Makes the driver list the devices from Mod1 on, this many. Not to be called while a request is
// handled.
void setDeviceCount(std::uint32_t count);
