#include "description/Environment.h"

#include <charconv>
#include <cstdlib>
#include <system_error>

#include "description/ErrorReport.h"

namespace simulator {

namespace {

constexpr const char* seedVariable = "QITRMC_SIM_SEED";
constexpr const char* timeScaleVariable = "QITRMC_SIM_TIME_SCALE";
constexpr double smallestFactor = 0.001;
constexpr double largestFactor = 1000000.0;

// The whole text as a number, the same in every locale.
template <typename Number>
std::optional<Number> numberIn(const std::string& text) {
    Number number{};
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc() || stop != end) {
        return std::nullopt;
    }
    return number;
}

std::optional<std::uint64_t> readSeed() {
    const std::string text = environmentText(seedVariable);
    if (text.empty()) {
        return std::nullopt;
    }
    const auto seed = numberIn<std::uint64_t>(text);
    if (!seed) {
        refuseVariable(seedVariable, "a whole number from 0 to 18446744073709551615");
    }
    return seed;
}

TimeScale readTimeScale() {
    const std::string text = environmentText(timeScaleVariable);
    if (text.empty()) {
        return {};
    }
    if (text == "calls") {
        return {1.0, true};
    }
    const auto factor = numberIn<double>(text);
    if (!factor || !(*factor >= smallestFactor && *factor <= largestFactor)) {
        refuseVariable(timeScaleVariable, "a number from 0.001 to 1000000, or the word calls");
    }
    return {*factor, false};
}

}  // namespace

std::string environmentText(const char* variable) {
    const char* text = std::getenv(variable);
    return text != nullptr ? text : "";
}

void refuseVariable(const char* variable, const std::string& right) {
    refuseStart(variable, {"", "is \"" + environmentText(variable) + "\"", "must be " + right});
}

Settings readSettings() {
    Settings settings;
    settings.seed = readSeed();
    settings.timeScale = readTimeScale();
    return settings;
}

}  // namespace simulator
