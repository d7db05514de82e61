#include "qitrmcwebsvc/propertyNames.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <string_view>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {
namespace {

// Sorted. These names are not listed to clients and do not count as driver-defined.
constexpr std::string_view hiddenNames[] = {
    "Dev.AddedToLocalConfig",
    "Dev.Events",
    "Dev.TCPIP.LastConnectedEthernetIP",
    "PhysChan.Events",
    "Session.Language",
    "Session.TCPIP.ConnectTimeout",
    "Session.TCPIP.ConnectTimeoutPerIP",
    "Session.TCPIP.KeepAliveInterval",
    "Session.TCPIP.KeepAliveTimeout",
    "Session.TCPIP.MDNSBrowseTimeout",
    "Session.TCPIP.SendRecvTimeout",
    "Sys.ConfigChangeCount",
};

bool isHidden(std::string_view name) {
    return std::binary_search(std::begin(hiddenNames), std::end(hiddenNames), name);
}

const char* nameListOf(PropertyCategory category) {
    switch (category) {
        case PropertyCategory::System:
            return "Sys.SystemProperties";
        case PropertyCategory::Session:
            return "Sys.SessionProperties";
        case PropertyCategory::Device:
            return "Sys.DeviceProperties";
        case PropertyCategory::PhysChan:
            return "Sys.PhysChanProperties";
        case PropertyCategory::NvmemArea:
            return "Sys.NVMEMAreaProperties";
    }
    throw nQITRMCSHAREDCMN100::InternalError("Unsupported property category", QITRMC_HERE);
}

// A list of names that the constructor reads from the driver.
class ListedNames : public DriverStringArray {
  public:
    ListedNames(nQITRMCAPI100_Session session, const char* list) {
        callDriver(nQITRMCAPI100_getSystemPropertyStringArray, session, list, outArray(),
                   outCount());
    }
};

}  // namespace

std::set<std::string> propertyNames(nQITRMCAPI100_Session session, PropertyCategory category) {
    const ListedNames listed(session, nameListOf(category));
    std::set<std::string> names;
    for (const char* name : listed) {
        if (!isHidden(name)) {
            names.emplace(name);
        }
    }
    return names;
}

bool isPropertyName(nQITRMCAPI100_Session session, PropertyCategory category,
                    const std::string& name) {
    const ListedNames listed(session, nameListOf(category));
    // Most names differ in the first character, which costs much less than a call.
    const char* const text = name.c_str();
    const bool isListed = std::any_of(listed.begin(), listed.end(), [text](const char* other) {
        return *other == *text && std::strcmp(other, text) == 0;
    });
    // Behind a NUL, which the driver's names cannot contain, strcmp does not look.
    return isListed && name.find('\0') == std::string::npos && !isHidden(name);
}

}  // namespace nQITRMCWEBSVC100
