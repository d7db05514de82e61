#pragma once

#include <cstdint>
#include <unordered_map>
#include <vector>

#include "live/Motion.h"

namespace simulator {

struct Resource;

// The motions of all properties of a chassis. Times are in microseconds of the simulated time, and
// never go back. Properties and resources are known by their addresses. Needs the simulator's
// mutex to be held.
class Life {
  public:
    // Lets a property of a resource move. The properties that it follows belong to `followed`,
    // which may be null. A property moves in one way only.
    void add(const Resource& owner, const Property& property, const Motion& motion,
             const Resource* followed);
    // Returns null for a property that keeps still.
    const Motion* find(const Property& property) const;

    // The present value: the stored one unless the property moves.
    Elements valueAt(const Property& property, int64_t now) const;

    // To be called after stored values of a resource have changed.
    void noteChange(const Resource& resource, int64_t now) noexcept;
    // To be called after a resource was reset: its motions begin again.
    void restart(const Resource& resource, int64_t now) noexcept;
    // Lets everything that follows something arrive there, as it was long before the load.
    void settle() noexcept;

    // From which all random numbers come.
    uint64_t seed = 1;

  private:
    Dice diceOf(const Motion& motion, int64_t now) const;
    double numberAt(const Property& property, const Motion& motion, int64_t now) const;
    Elements recordAt(const Property& property, const Motion& motion, int64_t now) const;

    std::unordered_map<const Property*, Motion> motions;
    std::unordered_map<const Resource*, std::vector<Motion*>> owned;
    // What comes near values of a resource exponentially.
    std::unordered_map<const Resource*, std::vector<Motion*>> followers;
};

}  // namespace simulator
