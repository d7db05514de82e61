#pragma once

#include <optional>
#include <string_view>

#include "sessions/ReadValue.h"
#include "sessions/Simulator.h"

namespace simulator {

// The value of a property that is computed instead of stored, or nothing when there is no such
// property or the resource lacks it. `resource` is null for the categories system and session.
std::optional<ReadValue> computedValue(const Simulator& simulator, const Session& session,
                                       Category category, const Resource* resource,
                                       const HashedName& name);

// Writes one of the session's lists of default resources. Refuses names that are unknown.
void setDefaultResources(const Resolver& resolver, Session& session, std::string_view property,
                         const std::vector<std::string>& names);

}  // namespace simulator
