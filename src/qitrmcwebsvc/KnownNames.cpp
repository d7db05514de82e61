#include "qitrmcwebsvc/KnownNames.h"

#include <array>
#include <atomic>
#include <cstddef>
#include <cstring>
#include <limits>

#include "qitrmcwebsvc/foldedText.h"

namespace nQITRMCWEBSVC100 {
namespace {

// Comparing with so few names costs less than a hash.
constexpr std::uint32_t fewNames = 32;
// So many searches cost about as much as an index.
constexpr unsigned fewSearches = 16;

constexpr std::uint32_t noPosition = std::numeric_limits<std::uint32_t>::max();

// Where names were found last, by their hashes. Any thread may change any position at any time.
std::array<std::atomic<std::uint32_t>, 16384> lastPositions;

}  // namespace

KnownNames::KnownNames(nQITRMCAPI100_Session session) {
    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", names.outArray(),
                                               names.outCount(), &status);
}

KnownNames::KnownNames(nQITRMCAPI100_Session session, const std::string& device,
                       const char* property) {
    nQITRMCAPI100_getGenericPropertyStringArray(session, device.c_str(), property, names.outArray(),
                                                names.outCount(), &status);
}

template <typename Condition>
std::uint32_t KnownNames::firstThat(Condition condition) const {
    for (std::uint32_t position = 0; position < names.size(); ++position) {
        if (condition(names[position])) {
            return position;
        }
    }
    return noPosition;
}

bool KnownNames::contains(const std::string& name) {
    if (status.code < 0) {
        return false;
    }
    if (names.size() > fewNames) {
        return containsInLongList(name);
    }
    return findSameBytes(name) != noPosition ||
           firstThat([&](const char* known) { return equalFolded(known, name); }) != noPosition;
}

bool KnownNames::containsInLongList(const std::string& name) {
    const std::uint32_t hash = hashFolded(name);
    if (!index.empty()) {
        return placeOf(name, hash) != noPosition;
    }
    std::atomic<std::uint32_t>& last = lastPositions[hash % lastPositions.size()];
    std::uint32_t position = last.load(std::memory_order_relaxed);
    if (position < names.size() && equalFolded(names[position], name)) {
        return true;
    }
    position = ++searches <= fewSearches ? findSameBytes(name) : noPosition;
    if (position == noPosition) {
        makeIndex();
        position = placeOf(name, hash);
    }
    last.store(position, std::memory_order_relaxed);
    return position != noPosition;
}

// Most names are spelled like the driver's, and comparing bytes takes a fraction of the time.
std::uint32_t KnownNames::findSameBytes(const std::string& name) const {
    return firstThat([&](const char* known) { return std::strcmp(known, name.c_str()) == 0; });
}

void KnownNames::makeIndex() {
    index.assign(std::size_t{2} * names.size(), noPosition);
    for (std::uint32_t position = 0; position < names.size(); ++position) {
        placeOf(names[position], hashFolded(names[position])) = position;
    }
}

std::uint32_t& KnownNames::placeOf(std::string_view name, std::uint32_t hash) {
    std::size_t place = hash % index.size();
    while (index[place] != noPosition && !equalFolded(names[index[place]], name)) {
        place = (place + 1) % index.size();
    }
    return index[place];
}

}  // namespace nQITRMCWEBSVC100
