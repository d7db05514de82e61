#pragma once

#include <limits>
#include <optional>
#include <string_view>
#include <vector>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// A pattern that consists of a literal text and perhaps digits after it.
struct SchemaPattern {
    std::string_view literal;
    bool endsInDigits;  // at least one
};

struct SchemaProperty;

// A schema compiled for SchemaPrecheck. It refers to the JSON values of the schema's text. Sets of
// types have the bits of typeBit().
struct SchemaNode {
    unsigned undecided = 0;                  // the types of values that are not checked
    unsigned allowed = ~0U;                  // the types of values that may be valid
    const JsonValue* enumeration = nullptr;  // an array of integers and strings, or null
    double minimum = -std::numeric_limits<double>::infinity();
    double maximum = std::numeric_limits<double>::infinity();
    std::optional<SchemaPattern> pattern;
    rapidjson::SizeType minItems = 0;
    std::vector<SchemaNode> items;  // one or none
    bool additionalProperties = true;
    std::vector<std::string_view> required;
    std::vector<SchemaProperty> properties;
    std::vector<SchemaNode> oneOf;
};

struct SchemaProperty {
    std::string_view name;
    SchemaNode schema;
};

inline std::string_view textOf(const JsonValue& string) {
    return {string.GetString(), string.GetStringLength()};
}

// A bit for the type of a value; doubles have one of their own.
inline unsigned typeBit(const JsonValue& value) {
    return 1U << (value.IsDouble() ? rapidjson::kNumberType + 1 : value.GetType());
}

// `schema` contains the definitions that it refers to. It must outlive the result and stay
// unchanged.
SchemaNode compileSchema(const JsonValue& schema);

}  // namespace nQITRMCWEBSVC100
