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

// Null when no status has the code.
const Entry* findCode(std::int32_t code);

// Letter case does not count, and the name of a group in front, such as "qitrmcsim_", may be left
// out where another status does not have the short name. Null when no status has the name.
const Entry* findName(std::string_view name);

// The three codes nearest to one that is unknown, the nearest first.
std::vector<Entry> nearestCodes(std::int32_t code);

// The names, up to three, that a mistyped or shortened one may stand for, the likeliest first.
std::vector<Entry> similarNames(std::string_view name);

}  // namespace explain
