#include <qitrmcapi.h>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/invalidParams.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

const char* listPropertyOf(ResourceKind kind) {
    if (kind == ResourceKind::Device) {
        return "Dev.Commands";
    }
    if (kind == ResourceKind::PhysicalChannel) {
        return "PhysChan.Commands";
    }
    throwInvalidParams("MustSpecifyOneOfDevicePhyChannel", QITRMC_HERE);
}

}  // namespace

// Lists the commands of a device or physical channel in the driver's order. Result: commands.
void GetCommandList::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const char* property = listPropertyOf(resource.kind());
    DriverStringArray names;
    callDriver(nQITRMCAPI100_getGenericPropertyStringArray, session->driverSession,
               resource.joinedNames().c_str(), property, names.outArray(), names.outCount());

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue commands(rapidjson::kArrayType);
    appendTexts(commands, names, allocator);
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("commands", commands, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
