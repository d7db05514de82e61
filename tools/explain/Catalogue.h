#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

// The codes and names of all statuses of the service and of the simulated driver. A driver may have
// further codes.
namespace explain {

struct Entry {
    std::int32_t code;
    std::string_view name;
};

// In the order of the tables.
const std::vector<Entry>& catalogue();

// Null if no status has the code.
const Entry* findCode(std::int32_t code);

// Ignores letter case. A prefix such as "qitrmcsim_" may be omitted if no other status has the
// shortened name. Null if no status has the name.
const Entry* findName(std::string_view name);

// The three codes nearest to an unknown code, the nearest first.
std::vector<Entry> nearestCodes(std::int32_t code);

// Up to three names for a mistyped or shortened name, the most similar first.
std::vector<Entry> similarNames(std::string_view name);

}  // namespace explain
