#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace simulator {

// How simulated time passes.
struct TimeScale {
    // Simulated seconds in one real second.
    double factor = 1.0;
    // Time advances by one step with each call only, and commands take no real time.
    bool byCalls = false;
};

// What the environment sets.
struct Settings {
    // Empty when that of the chassis file applies.
    std::optional<std::uint64_t> seed;
    TimeScale timeScale;
};

// The value of a variable of the environment; empty when it is not set.
std::string environmentText(const char* variable);

// Refuses to start because a variable has a wrong value. `right` completes "must be".
[[noreturn]] void refuseVariable(const char* variable, const std::string& right);

// Reads QITRMC_SIM_SEED and QITRMC_SIM_TIME_SCALE.
Settings readSettings();

}  // namespace simulator
