#pragma once

#include <qitrmcapi.h>

#include <cstdint>
#include <set>
#include <string>

namespace nQITRMCWEBSVC100 {

// The kind of object that a property belongs to.
enum class PropertyCategory : std::int32_t {
    System = 1,
    Session = 2,
    Device = 3,
    PhysChan = 4,
    NvmemArea = 5,
};

// The names of a category's properties as the driver lists them at this moment, without the names
// that are hidden from clients. Throws qierr::Exception if the driver cannot list them, and
// InternalError for an unknown category.
std::set<std::string> propertyNames(nQITRMCAPI100_Session session, PropertyCategory category);

// Whether propertyNames would contain the name, without building the set. Compares bytes.
bool isPropertyName(nQITRMCAPI100_Session session, PropertyCategory category,
                    const std::string& name);

}  // namespace nQITRMCWEBSVC100
