#pragma once

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "model/Chassis.h"
#include "status/Refusal.h"

namespace simulator {

// How the texts and arrays that a call returns are changed.
struct OutputFault {
    // Texts and arrays are null; the count of a null array is `count`.
    bool isNull = false;
    // The texts in arrays are null.
    bool hasNullItems = false;
    // The length of every text in bytes, and the elements of every array.
    std::optional<std::uint32_t> textSize;
    std::optional<std::uint32_t> count;
};

// Which calls a fault applies to, and what it does to them.
class Fault {
  public:
    // The name of a function without its prefix, or the beginning of such names.
    std::string function;
    bool isBeginning = true;
    // A method of the service instead, for all functions that it calls; empty for none.
    std::string method;
    // Null for calls about anything.
    const Resource* resource = nullptr;
    // Of the calls that match: the first that the fault applies to, the distance from one to the
    // next, and how many.
    std::uint64_t first = 1;
    std::uint64_t every = 1;
    std::uint64_t count = std::numeric_limits<std::uint64_t>::max();
    // Of these calls again, the fraction that the fault applies to, 0 to 1.
    double probability = 1.0;
    // Seconds since the plan came into force, between which the fault applies.
    double begin = 0.0;
    double end = std::numeric_limits<double>::infinity();

    // Seconds.
    double delay = 0.0;
    // A failure or a warning.
    std::optional<Refusal> status;
    // Whether a call that fails is carried out first.
    bool failsAfterwards = false;
    std::optional<OutputFault> output;

    bool matchesFunction(std::string_view name) const;
    // Counts a call that matches. Returns whether the fault applies to it. The same seed, the same
    // place in the plan and the same number of calls give the same result.
    bool countCall(std::uint32_t seed, std::size_t place);

  private:
    std::uint64_t matched = 0;
};

// A device does not answer for a while.
struct DeviceEvent {
    const Device* device;
    Absence absence;
    // Seconds since the plan came into force.
    double begin;
    double end;
};

struct FaultPlan {
    bool isEmpty() const { return faults.empty() && events.empty(); }

    // The description that this was read from.
    std::string text = "{}";
    std::uint32_t seed = 0;
    std::vector<Fault> faults;
    std::vector<DeviceEvent> events;
};

}  // namespace simulator
