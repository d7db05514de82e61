#include <qitrmcapi.h>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/chassis.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

// In the order of the result.
constexpr std::pair<const char*, const char*> identityProperties[] = {
    {"chassis_ip", "Dev.TCPIP.EthernetIP"},
    {"chassis_hostname", "Dev.TCPIP.Hostname"},
};

}  // namespace

// Reads the network address and host name of a chassis. Throws BasicError notChassis if the device
// is not a chassis. Result: chassis_ip, chassis_hostname.
void GetChassisIpOrHostname::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    requireChassis(resource, session);
    // For a null name, the driver uses the session's default device.
    const auto device = params.FindMember("device");
    const char* name = device == params.MemberEnd() ? nullptr : device->value.GetString();

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    for (const auto& [key, property] : identityProperties) {
        DriverString text;
        callDriver(nQITRMCAPI100_getDevicePropertyString, session->driverSession, name, property,
                   text.out());
        result.AddMember(rapidjson::StringRef(key), textValue(text.copy(), allocator), allocator);
    }
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
