#include "qitrmcwebsvc/procedure/SetNvmemBytes.h"

#include <qitrmcapi.h>

#include <vector>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {
namespace {

std::vector<std::uint8_t> bytesOf(const JsonValue& data) {
    std::vector<std::uint8_t> bytes;
    bytes.reserve(data.Size());
    for (const JsonValue& element : data.GetArray())
        bytes.push_back(static_cast<std::uint8_t>(element.GetUint()));
    return bytes;
}

}  // namespace

void SetNvmemBytes::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                        SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    const std::uint32_t address = uintParam(params, "address");
    const std::vector<std::uint8_t> bytes = bytesOf(params["data"]);
    const std::string serialNumber = textParam(params, "serial_number", "");
    const std::string password = textParam(params, "password", "");
    callDriver(nQITRMCAPI100_setNvmemBytes, session->driverSession, resource.joinedNames().c_str(),
               address, bytes.data(), static_cast<std::uint32_t>(bytes.size()),
               serialNumber.c_str(), password.c_str());

    JsonPool& pool = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("next_address", address + 1, pool);
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
