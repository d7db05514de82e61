#include <qitrmcapi.h>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

template <typename Register>
using Read = void (*)(nQITRMCAPI100_Session, const char*, std::uint32_t, Register*, qierr_Status*);

template <typename Register>
std::uint64_t readWith(Read<Register> function, nQITRMCAPI100_Session session, const char* device,
                       std::uint32_t address) {
    Register data = 0;
    callDriver(function, session, device, address, &data);
    return data;
}

std::uint64_t readRegister(std::uint32_t size, nQITRMCAPI100_Session session, const char* device,
                           std::uint32_t address) {
    switch (size) {
        case 8:
            return readWith(nQITRMCAPI100_readRegisterUInt8, session, device, address);
        case 16:
            return readWith(nQITRMCAPI100_readRegisterUInt16, session, device, address);
        case 32:
            return readWith(nQITRMCAPI100_readRegisterUInt32, session, device, address);
        case 64:
            return readWith(nQITRMCAPI100_readRegisterUInt64, session, device, address);
    }
    throw nQITRMCSHAREDCMN100::InternalError("Unsupported register size.", QITRMC_HERE);
}

}  // namespace

// Reads one register of a device. Result: next_address, which is the address plus 1 for any size,
// and data.
void ReadRegister::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    const std::uint32_t address = uintParam(params, "address");
    const std::uint32_t size = registerSizeParam(params);
    const std::uint64_t data =
        readRegister(size, session->driverSession, resource.joinedNames().c_str(), address);

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("next_address", address + 1, allocator);
    result.AddMember("data", data, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
