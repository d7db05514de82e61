#include <qitrmcapi.h>

#include <cstdlib>
#include <new>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/compactJson.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

struct Free {
    void operator()(void* memory) const { std::free(memory); }
};
using Buffer = std::unique_ptr<std::uint8_t[], Free>;

// Null for a size of 0. The system provides zeroed pages without touching them, so a request for
// more bytes than an area has costs little before the driver rejects it.
Buffer zeroedBuffer(std::uint32_t size) {
    if (size == 0) {
        return nullptr;
    }
    Buffer buffer(static_cast<std::uint8_t*>(std::calloc(size, 1)));
    if (buffer == nullptr) {
        throw std::bad_alloc();
    }
    return buffer;
}

}  // namespace

// Reads bytes of an NVMEM area. Result: data, and next_address, which is the address plus 1 for any
// number of bytes.
void GetNvmemBytes::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const std::uint32_t address = uintParam(params, "address");
    const std::uint32_t size = uintParam(params, "size");
    const Buffer buffer = zeroedBuffer(size);
    callDriver(nQITRMCAPI100_getNvmemBytes, session->driverSession, resource.joinedNames().c_str(),
               address, buffer.get(), size);

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("data", byteArray(buffer.get(), size, allocator), allocator);
    result.AddMember("next_address", address + 1, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
