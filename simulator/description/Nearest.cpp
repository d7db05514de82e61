#include "description/Nearest.h"

#include <algorithm>
#include <cstddef>

namespace simulator {

namespace {

constexpr std::size_t longest = 64;

char lowered(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

// How many bytes must be put in, left out, replaced or exchanged with their neighbour to make one
// name of the other.
std::size_t distance(std::string_view left, std::string_view right) {
    std::vector<std::size_t> before;
    std::vector<std::size_t> last;
    std::vector<std::size_t> row(right.size() + 1);
    for (std::size_t j = 0; j <= right.size(); ++j) {
        row[j] = j;
    }
    for (std::size_t i = 1; i <= left.size(); ++i) {
        before = std::move(last);
        last = row;
        row[0] = i;
        for (std::size_t j = 1; j <= right.size(); ++j) {
            const bool same = lowered(left[i - 1]) == lowered(right[j - 1]);
            row[j] = std::min({last[j] + 1, row[j - 1] + 1, last[j - 1] + (same ? 0 : 1)});
            if (i > 1 && j > 1 && lowered(left[i - 1]) == lowered(right[j - 2]) &&
                lowered(left[i - 2]) == lowered(right[j - 1])) {
                row[j] = std::min(row[j], before[j - 2] + 1);
            }
        }
    }
    return row[right.size()];
}

}  // namespace

const std::string* nearestName(std::string_view given, const std::vector<std::string>& known) {
    if (given.empty() || given.size() > longest) {
        return nullptr;
    }
    std::size_t least = given.size() / 3 + 1;
    const std::string* nearest = nullptr;
    for (const std::string& name : known) {
        if (name.size() < given.size() + least && given.size() < name.size() + least) {
            const std::size_t apart = distance(given, name);
            if (apart < least) {
                least = apart;
                nearest = &name;
            }
        }
    }
    return nearest;
}

std::string perhapsMeant(std::string_view given, const std::vector<std::string>& known) {
    const std::string* nearest = nearestName(given, known);
    return nearest == nullptr ? std::string() : "perhaps \"" + *nearest + "\" is meant; ";
}

}  // namespace simulator
