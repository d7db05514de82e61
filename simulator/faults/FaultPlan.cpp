#include "faults/FaultPlan.h"

#include <algorithm>

#include "MethodFunctions.h"

namespace simulator {

namespace {

// A number from 0 to below 1 that depends on every bit of the given number, evenly distributed.
double drawOf(std::uint64_t number) {
    number += 0x9E3779B97F4A7C15u;
    number = (number ^ (number >> 30)) * 0xBF58476D1CE4E5B9u;
    number = (number ^ (number >> 27)) * 0x94D049BB133111EBu;
    number ^= number >> 31;
    constexpr double range = 9007199254740992.0;
    return static_cast<double>(number >> 11) / range;
}

}  // namespace

bool Fault::matchesFunction(std::string_view name) const {
    if (!method.empty()) {
        return std::any_of(std::begin(methodFunctions), std::end(methodFunctions),
                           [&](const MethodFunction& known) {
                               return known.method == method && known.function == name;
                           });
    }
    return isBeginning ? name.substr(0, function.size()) == function : name == function;
}

bool Fault::countCall(std::uint32_t seed, std::size_t place) {
    ++matched;
    if (matched < first || (matched - first) % every != 0 || (matched - first) / every >= count) {
        return false;
    }
    // Odd factors, so that adjacent numbers give unrelated results.
    constexpr std::uint64_t seedFactor = 0xD1342543DE82EF95u;
    constexpr std::uint64_t placeFactor = 0xAF251AF3B0F025B5u;
    return drawOf(seed * seedFactor + place * placeFactor + matched) < probability;
}

}  // namespace simulator
