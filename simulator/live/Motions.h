#pragma once

#include <cstdint>
#include <unordered_map>
#include <vector>

#include "live/Motion.h"

namespace simulator {

struct Resource;

// The motions of all properties of a chassis. Times are in microseconds of the simulated time, and
// never go back. Properties and resources are identified by their addresses. Needs the simulator's
// mutex to be held.
class Motions {
  public:
    // Lets a property of a resource move. The properties that it follows belong to `followed`,
    // which may be null. A property moves in one way only.
    void add(const Resource& owner, const Property& property, const Motion& motion,
             const Resource* followed);
    // Returns null for a property that does not move.
    const Motion* find(const Property& property) const;

    // The present value: the stored one unless the property moves.
    Elements valueAt(const Property& property, std::int64_t now) const;

    // To be called after stored values of a resource have changed.
    void noteChange(const Resource& resource, std::int64_t now) noexcept;
    // To be called after a resource was reset: its motions begin again.
    void restart(const Resource& resource, std::int64_t now) noexcept;
    // Puts everything that follows a value at its target, as if it had long been there.
    void settle() noexcept;

    // The seed of all random numbers.
    std::uint64_t seed = 1;

  private:
    RandomStream randomOf(const Motion& motion, std::int64_t now) const;
    double numberAt(const Property& property, const Motion& motion, std::int64_t now) const;
    Elements recordAt(const Property& property, const Motion& motion, std::int64_t now) const;

    std::unordered_map<const Property*, Motion> motions;
    std::unordered_map<const Resource*, std::vector<Motion*>> owned;
    // The motions that approach values of a resource exponentially.
    std::unordered_map<const Resource*, std::vector<Motion*>> followers;
};

}  // namespace simulator
