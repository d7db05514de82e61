#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"
#include "qitrmcwebsvc/procedure/propertyValues.h"

namespace nQITRMCWEBSVC100 {

// Reads a property. Result: data_type, value.
void GetProperty::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const std::string name = textParam(params, "property");
    const RequestResource resource(params, *session);
    const SessionProperty property(session, name, resource);
    const PropertyValueType* type = propertyValueType(property.dataType());
    if (type == nullptr) {
        throw nQITRMCSHAREDCMN100::InternalError("Unsupported data type for dynamic property.",
                                                 QITRMC_HERE);
    }
    JsonAllocator& allocator = *response.getAllocator();
    JsonValue value = type->read(property, allocator);

    JsonValue result(rapidjson::kObjectType);
    result.AddMember("data_type", enumItemValue("DataType", property.dataType(), allocator),
                     allocator);
    result.AddMember("value", value, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
