#include <qitrmcapi.h>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/invalidParams.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"
#include "qitrmcwebsvc/propertyNames.h"

namespace nQITRMCWEBSVC100 {
namespace {

struct Lists {
    PropertyCategory category;
    const char* dynamicProperty;  // null if there is none
};

Lists listsOf(ResourceKind kind) {
    switch (kind) {
        case ResourceKind::Device:
            return {PropertyCategory::Device, "Dev.Properties"};
        case ResourceKind::PhysicalChannel:
            return {PropertyCategory::PhysChan, "PhysChan.Properties"};
        case ResourceKind::NvmemArea:
            return {PropertyCategory::NvmemArea, nullptr};
        case ResourceKind::None:
            break;
    }
    throwInvalidParams("MustSpecifyOneOfDeviceNvmemPhyChannel", QITRMC_HERE);
}

// A failure to list the resource's own properties is ignored: the properties of its kind are listed
// anyway.
void addDynamicNames(JsonValue& result, nQITRMCAPI100_Session session,
                     const RequestResource& resource, const char* property,
                     JsonAllocator& allocator) {
    qierr::Status status;
    DriverStringArray names;
    nQITRMCAPI100_getGenericPropertyStringArray(session, resource.joinedNames().c_str(), property,
                                                names.outArray(), names.outCount(), &status);
    if (status.code < 0) {
        return;
    }
    JsonValue dynamicNames(rapidjson::kArrayType);
    appendTexts(dynamicNames, names, allocator);
    result.AddMember("dynamic_properties", dynamicNames, allocator);
}

}  // namespace

// Lists the properties of a kind of resource, sorted, and those that one resource defines for
// itself, in the driver's order. The latter are left out for NVMEM areas, which define none, and
// when the driver cannot list them. Result: static_properties, dynamic_properties.
void GetDevicePropertyList::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const Lists lists = listsOf(resource.kind());

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    JsonValue staticNames(rapidjson::kArrayType);
    appendTexts(staticNames, propertyNames(session->driverSession, lists.category), allocator);
    result.AddMember("static_properties", staticNames, allocator);
    if (lists.dynamicProperty != nullptr) {
        addDynamicNames(result, session->driverSession, resource, lists.dynamicProperty, allocator);
    }
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
