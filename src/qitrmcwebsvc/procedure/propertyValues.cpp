#include "qitrmcwebsvc/procedure/propertyValues.h"

#include <algorithm>
#include <string>
#include <vector>

#include "qitrmcwebsvc/procedure/jsonValues.h"

namespace nQITRMCWEBSVC100 {
namespace {

// The conversion between a C++ type and JSON. This is the one for integers, whose ranges the JSON
// library checks; the other types have specialisations.
template <typename Integer>
struct JsonForm {
    static bool accepts(const JsonValue& value) { return value.Is<Integer>(); }
    static Integer parse(const JsonValue& value) { return value.Get<Integer>(); }
    static JsonValue make(Integer value, JsonAllocator&) { return JsonValue(value); }
};

template <>
struct JsonForm<bool> {
    static bool accepts(const JsonValue& value) { return value.IsBool(); }
    static bool parse(const JsonValue& value) { return value.IsTrue(); }
    static JsonValue make(bool value, JsonAllocator&) { return JsonValue(value); }
};

template <>
struct JsonForm<double> {
    static bool accepts(const JsonValue& value) { return value.IsNumber(); }
    static double parse(const JsonValue& value) { return value.GetDouble(); }
    static JsonValue make(double value, JsonAllocator&) { return JsonValue(value); }
};

template <>
struct JsonForm<std::string> {
    static bool accepts(const JsonValue& value) { return value.IsString(); }
    static std::string parse(const JsonValue& value) { return value.GetString(); }
    static JsonValue make(const std::string& value, JsonAllocator& allocator) {
        return textValue(value, allocator);
    }
};

template <typename Item>
struct JsonForm<std::vector<Item>> {
    static bool accepts(const JsonValue& value) {
        return value.IsArray() && std::all_of(value.Begin(), value.End(), JsonForm<Item>::accepts);
    }
    static std::vector<Item> parse(const JsonValue& value) {
        std::vector<Item> items;
        items.reserve(value.Size());
        for (const JsonValue& item : value.GetArray()) {
            items.push_back(JsonForm<Item>::parse(item));
        }
        return items;
    }
    static JsonValue make(const std::vector<Item>& items, JsonAllocator& allocator) {
        JsonValue array(rapidjson::kArrayType);
        reserveElements(array, items.size(), allocator);
        for (const auto& item : items) {
            array.PushBack(JsonForm<Item>::make(item, allocator), allocator);
        }
        return array;
    }
};

template <typename Value, Value (SessionProperty::*get)() const>
JsonValue read(const SessionProperty& property, JsonAllocator& allocator) {
    return JsonForm<Value>::make((property.*get)(), allocator);
}

template <typename Value, void (SessionProperty::*set)(const Value&)>
void write(SessionProperty& property, const JsonValue& value) {
    (property.*set)(JsonForm<Value>::parse(value));
}

constexpr PropertyValueType types[] = {
#define QITRMC_PROPERTY_TYPE(number, Type, Value)                                \
    {number, JsonForm<Value>::accepts, read<Value, &SessionProperty::get##Type>, \
     write<Value, &SessionProperty::set##Type>},
#include "qitrmcwebsvc/propertyTypes.def"
};

}  // namespace

const PropertyValueType* propertyValueType(std::int32_t dataType) {
    for (const PropertyValueType& type : types) {
        if (type.dataType == dataType) {
            return &type;
        }
    }
    return nullptr;
}

}  // namespace nQITRMCWEBSVC100
