#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"
#include "qitrmcwebsvc/propertyNames.h"

namespace nQITRMCWEBSVC100 {

// Lists the properties of the session and then of the system, each half sorted. Result: properties.
void GetSessionPropertyList::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    JsonAllocator& allocator = *response.getAllocator();
    JsonValue properties(rapidjson::kArrayType);
    for (const PropertyCategory category : {PropertyCategory::Session, PropertyCategory::System}) {
        appendTexts(properties, propertyNames(session->driverSession, category), allocator);
    }

    JsonValue result(rapidjson::kObjectType);
    result.AddMember("properties", properties, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
