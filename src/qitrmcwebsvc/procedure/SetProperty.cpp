#include <qitrmcapi.h>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"
#include "qitrmcwebsvc/procedure/propertyValues.h"

namespace nQITRMCWEBSVC100 {

using nQITRMCSHAREDCMN100::BasicError;

namespace {

// A scalar may be written as an array of one element.
const JsonValue& scalarUnwrap(const JsonValue& value, const SessionProperty& property) {
    return property.isScalar() && value.IsArray() && value.Size() == 1 ? value[0] : value;
}

// Does not check a value of an unknown data type; run() throws for it.
void checkRequestedType(const JsonValue& value, const SessionProperty& property) {
    const PropertyValueType* type = propertyValueType(property.dataType());
    if (type == nullptr || type->accepts(value)) {
        return;
    }
    BasicError error(qierr::codes::wrongValueType, QITRMC_HERE);
    addUsageString(error.details(), "kUsageTypeRequestedDataType",
                   nQITRMCAPI100_translateStaticEnumValueToString("DataType", property.dataType()));
    throw error;
}

}  // namespace

// Writes a property; the change takes effect with a commit. A scalar may be given as an array of
// one element. Throws BasicError wrongValueType for a value that is not of the property's type.
// Result: data_type.
void SetProperty::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const std::string name = textParam(params, "property");
    const RequestResource resource(params, *session);
    SessionProperty property(session, name, resource);
    const JsonValue& value = scalarUnwrap(params["value"], property);
    checkRequestedType(value, property);
    const PropertyValueType* type = propertyValueType(property.dataType());
    if (type == nullptr) {
        throw BasicError(QITRMC_HERE);
    }
    type->write(property, value);

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("data_type", enumItemValue("DataType", property.dataType(), allocator),
                     allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
