#include "qitrmcwebsvc/procedure/GetSessionPropertyList.h"

#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/propertyNames.h"

namespace nQITRMCWEBSVC100 {

void GetSessionPropertyList::run(const JsonValue&, const std::shared_ptr<SessionContext>& session,
                                 SingleResponse& response) {
    JsonPool& pool = *response.getAllocator();
    JsonValue properties(rapidjson::kArrayType);
    for (const PropertyCategory category : {PropertyCategory::Session, PropertyCategory::System})
        appendTexts(properties, propertyNames(session->driverSession, category), pool);

    JsonValue result(rapidjson::kObjectType);
    result.AddMember("properties", properties, pool);
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
