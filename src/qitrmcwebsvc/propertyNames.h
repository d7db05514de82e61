#pragma once

#include <qitrmcapi.h>

#include <cstdint>
#include <set>
#include <string>

namespace nQITRMCWEBSVC100 {

// What a property belongs to.
enum class PropertyCategory : std::int32_t {
    System = 1,
    Session = 2,
    Device = 3,
    PhysChan = 4,
    NvmemArea = 5,
};

// The names of a category's properties as the driver lists them at this moment, without those that
// are kept from clients. Throws qierr::Exception when the driver refuses its list, and
// InternalError for a number that is no category.
std::set<std::string> propertyNames(nQITRMCAPI100_Session session, PropertyCategory category);

// Whether propertyNames holds the name, without making the set. Compares bytes.
bool isPropertyName(nQITRMCAPI100_Session session, PropertyCategory category,
                    const std::string& name);

}  // namespace nQITRMCWEBSVC100
