#include "explain/Catalogue.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <numeric>
#include <string>
#include <utility>

namespace explain {
namespace {

constexpr std::size_t mostSuggestions = 3;

char lowered(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

std::string lowered(std::string_view text) {
    std::string result(text);
    for (char& c : result) {
        c = lowered(c);
    }
    return result;
}

std::string_view withoutGroup(std::string_view name) {
    return name.substr(name.find('_') + 1);
}

// The edit distance: the number of insertions, deletions and replacements of characters.
std::size_t distance(const std::string& left, const std::string& right) {
    std::vector<std::size_t> row(right.size() + 1);
    std::iota(row.begin(), row.end(), 0);
    for (std::size_t i = 0; i < left.size(); ++i) {
        std::size_t diagonal = row[0];
        row[0] = i + 1;
        for (std::size_t j = 0; j < right.size(); ++j) {
            const std::size_t replaced = diagonal + (left[i] == right[j] ? 0 : 1);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, diagonal + 1});
        }
    }
    return row.back();
}

// A text that is part of a name counts as equal to it.
std::size_t distanceToName(const std::string& given, std::string_view name) {
    const std::string whole = lowered(name);
    if (whole.find(given) != std::string::npos) {
        return 0;
    }
    return std::min(distance(given, whole), distance(given, lowered(withoutGroup(name))));
}

// The entries with the smallest distances; those with equal distances in the order of the table.
std::vector<Entry> nearest(std::vector<std::pair<std::int64_t, Entry>> distances) {
    std::stable_sort(distances.begin(), distances.end(),
                     [](const auto& left, const auto& right) { return left.first < right.first; });
    std::vector<Entry> entries;
    for (const auto& [apart, entry] : distances) {
        if (entries.size() < mostSuggestions) {
            entries.push_back(entry);
        }
    }
    return entries;
}

}  // namespace

const std::vector<Entry>& catalogue() {
    static const std::vector<Entry> entries = {
#include "CatalogueRows.inc"
    };
    return entries;
}

const Entry* findCode(std::int32_t code) {
    for (const Entry& entry : catalogue()) {
        if (entry.code == code) {
            return &entry;
        }
    }
    return nullptr;
}

const Entry* findName(std::string_view name) {
    const std::string wanted = lowered(name);
    const Entry* shortened = nullptr;
    for (const Entry& entry : catalogue()) {
        if (lowered(entry.name) == wanted) {
            return &entry;
        }
        if (shortened == nullptr && lowered(withoutGroup(entry.name)) == wanted) {
            shortened = &entry;
        }
    }
    return shortened;
}

std::vector<Entry> nearestCodes(std::int32_t code) {
    std::vector<std::pair<std::int64_t, Entry>> distances;
    for (const Entry& entry : catalogue()) {
        distances.emplace_back(std::abs(std::int64_t{entry.code} - code), entry);
    }
    return nearest(std::move(distances));
}

std::vector<Entry> similarNames(std::string_view name) {
    const std::string given = lowered(name);
    std::vector<std::pair<std::int64_t, Entry>> distances;
    for (const Entry& entry : catalogue()) {
        const std::size_t apart = distanceToName(given, entry.name);
        if (apart <= given.size() / 3) {
            distances.emplace_back(apart, entry);
        }
    }
    return nearest(std::move(distances));
}

}  // namespace explain
