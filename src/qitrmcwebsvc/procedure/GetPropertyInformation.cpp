#include <algorithm>
#include <utility>

#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

// Sorted by key, which is the order of the result.
constexpr std::pair<const char*, const char*> propertyInfoKeys[] = {
    {"description", "Prop.Descr"},  {"document", "Prop.Doc"}, {"max_value", "Prop.MaxValue"},
    {"min_value", "Prop.MinValue"}, {"unit", "Prop.Unit"},
};

void addTexts(JsonValue& result, const SessionProperty& property, JsonAllocator& allocator) {
    for (const auto& [key, attribute] : propertyInfoKeys) {
        const std::string text = property.metaString(attribute);
        if (!text.empty()) {
            result.AddMember(rapidjson::StringRef(key), textValue(text, allocator), allocator);
        }
    }
}

// The items keep the driver's order.
JsonValue enumValue(const SessionProperty& property, JsonAllocator& allocator) {
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("name", textValue(property.metaString("Prop.Enum.Name"), allocator),
                     allocator);
    const std::vector<std::string> names = property.metaStringArray("Prop.Enum.ValueNames");
    const std::vector<std::int32_t> numbers = property.metaInt32Array("Prop.Enum.Values");
    JsonValue items(rapidjson::kObjectType);
    // The driver should return two lists of the same length.
    for (std::size_t i = 0; i < std::min(numbers.size(), names.size()); ++i) {
        items.AddMember(textValue(names[i], allocator), JsonValue(numbers[i]), allocator);
    }
    result.AddMember("values", items, allocator);
    return result;
}

}  // namespace

// Reads the attributes of a property. Result: description, document, max_value, min_value and unit
// unless they are empty; data_type, access, driver_defined, pending_changes; for an enumerated
// property enum.
void GetPropertyInformation::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const std::string name = textParam(params, "property");
    const RequestResource resource(params, *session);
    const SessionProperty property(session, name, resource);

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    addTexts(result, property, allocator);
    result.AddMember("data_type",
                     enumItemValue("DataType", property.metaInt32("Prop.DataType"), allocator),
                     allocator);
    result.AddMember("access",
                     enumItemValue("PropertyAccess", property.metaInt32("Prop.Access"), allocator),
                     allocator);
    result.AddMember("driver_defined", property.isDriverDefined(), allocator);
    result.AddMember("pending_changes", property.metaBool("Prop.PendingChanges"), allocator);
    if (property.metaBool("Prop.IsEnum")) {
        result.AddMember("enum", enumValue(property, allocator), allocator);
    }
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
