#include <qitrmcapi.h>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

bool fits(std::uint64_t data, std::uint32_t size) {
    return size >= 64 || data >> size == 0;
}

void writeRegister(std::uint32_t size, nQITRMCAPI100_Session session, const char* device,
                   std::uint32_t address, std::uint64_t data) {
    // Each function truncates the data to its own width.
    switch (size) {
        case 8:
            return callDriver(nQITRMCAPI100_writeRegisterUInt8, session, device, address, data);
        case 16:
            return callDriver(nQITRMCAPI100_writeRegisterUInt16, session, device, address, data);
        case 32:
            return callDriver(nQITRMCAPI100_writeRegisterUInt32, session, device, address, data);
        case 64:
            return callDriver(nQITRMCAPI100_writeRegisterUInt64, session, device, address, data);
    }
    throw InternalError("Unsupported register size.", QITRMC_HERE);
}

}  // namespace

// Writes one register of a device. Throws BasicError dataTooWide for data with bits above the
// register's size. Result: next_address, which is the address plus 1 for any size.
void WriteRegister::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    const std::uint32_t address = uintParam(params, "address");
    const std::uint32_t size = registerSizeParam(params);
    const std::uint64_t data = params["data"].GetUint64();
    if (!fits(data, size)) {
        throw BasicError(qierr::codes::dataTooWide, QITRMC_HERE);
    }
    writeRegister(size, session->driverSession, resource.joinedNames().c_str(), address, data);

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("next_address", address + 1, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
