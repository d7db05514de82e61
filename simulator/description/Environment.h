#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace simulator {

// How simulated time passes.
struct TimeScale {
    // Simulated seconds in one real second.
    double factor = 1.0;
    // Time stands still but for one step with each call, and commands take no real time.
    bool byCalls = false;
};

// What the environment says about how the simulator runs.
struct Settings {
    // Nothing when the chassis file may choose.
    std::optional<uint64_t> seed;
    TimeScale timeScale;
};

// The value of a variable of the environment; empty when it is not set.
std::string environmentText(const char* variable);

// Refuses to start because a variable has a wrong value. `right` goes on behind "must be".
[[noreturn]] void refuseVariable(const char* variable, const std::string& right);

// Reads QITRMC_SIM_SEED and QITRMC_SIM_TIME_SCALE.
Settings readSettings();

}  // namespace simulator
