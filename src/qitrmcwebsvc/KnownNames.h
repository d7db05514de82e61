#pragma once

#include <qitrmcapi.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "qierr/Status.h"
#include "qitrmcwebsvc/DriverOwners.h"

namespace nQITRMCWEBSVC100 {

// A list of names that the constructor reads from the driver, in which the names of a request are
// searched for without regard to case. Used by one thread.
//
// In a long list a name is first compared with the entry at the position where it was found in an
// earlier request. The list is the present one, so it does not matter whether the driver has
// changed it since. A request that needs more than a few searches indexes the list.
class KnownNames {
  public:
    // The names of all devices.
    explicit KnownNames(nQITRMCAPI100_Session session);
    // The names in a property of a device.
    KnownNames(nQITRMCAPI100_Session session, const std::string& device, const char* property);

    // Whether the list contains the name, which contains no NUL. False if the list could not be
    // read. Throws std::bad_alloc.
    bool contains(const std::string& name);

  private:
    bool containsInLongList(const std::string& name);
    void makeIndex();
    // The place in the index of an equal name, or the empty place for it.
    std::uint32_t& placeOf(std::string_view name, std::uint32_t hash);

    template <typename Condition>
    std::uint32_t firstThat(Condition condition) const;
    std::uint32_t findSameBytes(const std::string& name) const;

    qierr::Status status;
    DriverStringArray names;
    unsigned searches = 0;
    // Positions of names, ordered by their hashes; empty until it is needed.
    std::vector<std::uint32_t> index;
};

}  // namespace nQITRMCWEBSVC100
