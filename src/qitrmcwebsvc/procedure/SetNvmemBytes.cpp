#include <qitrmcapi.h>

#include <vector>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

std::vector<std::uint8_t> bytesOf(const JsonValue& data) {
    std::vector<std::uint8_t> bytes;
    bytes.reserve(data.Size());
    for (const JsonValue& element : data.GetArray()) {
        bytes.push_back(static_cast<std::uint8_t>(element.GetUint()));
    }
    return bytes;
}

}  // namespace

// Writes bytes to an NVMEM area; a commit makes them permanent. Result: next_address, which is the
// address plus 1 for any number of bytes.
void SetNvmemBytes::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const std::uint32_t address = uintParam(params, "address");
    const std::vector<std::uint8_t> bytes = bytesOf(params["data"]);
    const std::string serialNumber = textParam(params, "serial_number", "");
    const std::string password = textParam(params, "password", "");
    callDriver(nQITRMCAPI100_setNvmemBytes, session->driverSession, resource.joinedNames().c_str(),
               address, bytes.data(), static_cast<std::uint32_t>(bytes.size()),
               serialNumber.c_str(), password.c_str());

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("next_address", address + 1, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
