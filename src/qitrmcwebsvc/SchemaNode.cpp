#include "qitrmcwebsvc/SchemaNode.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "qitrmcwebsvc/SchemaRun.h"
#include "qitrmcwebsvc/findMember.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr unsigned bit(int type) {
    return 1U << static_cast<unsigned>(type);
}

constexpr unsigned allTypes = ~0U;
constexpr unsigned containers = bit(rapidjson::kObjectType) | bit(rapidjson::kArrayType);
constexpr unsigned integers = bit(rapidjson::kNumberType);
constexpr unsigned doubles = bit(rapidjson::kNumberType + 1);

bool endsWith(std::string_view text, std::string_view end) {
    return text.size() >= end.size() && text.substr(text.size() - end.size()) == end;
}

// Whether the text has no character with a meaning in patterns or JSON pointers.
bool isPlain(std::string_view text) {
    return std::all_of(text.begin(), text.end(), [](char c) {
        return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') ||
               c == '_';
    });
}

bool hasRepeatedName(const JsonValue& object) {
    for (auto member = object.MemberBegin(); member != object.MemberEnd(); ++member) {
        if (object.FindMember(member->name) != member) {
            return true;
        }
    }
    return false;
}

// The definition that the value of a `$ref` names, or null.
const JsonValue* resolve(const JsonValue& root, const JsonValue& reference) {
    constexpr std::string_view prefix = "#/definitions/";
    const JsonValue* const definitions = findMember(root, "definitions");
    if (!definitions || !reference.IsString() ||
        textOf(reference).substr(0, prefix.size()) != prefix ||
        !isPlain(textOf(reference).substr(prefix.size()))) {
        return nullptr;
    }
    return findMember(*definitions, reference.GetString() + prefix.size());
}

// Where a schema is: in which document, and the depth of the values that it describes, which is 1
// for a request.
struct Place {
    const JsonValue& root;
    int depth;

    Place below() const { return {root, depth + 1}; }
};

SchemaNode compile(const JsonValue& schema, Place place);

// Each of these functions reads the value of a keyword into `node`. It returns false for a value
// that SchemaPrecheck cannot check.

bool readType(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    static constexpr std::pair<std::string_view, unsigned> types[] = {
        {"null", bit(rapidjson::kNullType)},
        {"boolean", bit(rapidjson::kFalseType) | bit(rapidjson::kTrueType)},
        {"object", bit(rapidjson::kObjectType)},
        {"array", bit(rapidjson::kArrayType)},
        {"string", bit(rapidjson::kStringType)},
        {"integer", integers},
        {"number", integers | doubles},
    };
    const auto* const found = std::find_if(
        std::begin(types), std::end(types),
        [&](const auto& type) { return value.IsString() && textOf(value) == type.first; });
    node.allowed &= found == std::end(types) ? allTypes : found->second;
    return found != std::end(types);
}

bool readEnum(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    node.enumeration = &value;
    return value.IsArray() && std::all_of(value.Begin(), value.End(), [](const JsonValue& entry) {
               return entry.IsString() || typeBit(entry) == integers;
           });
}

bool readPattern(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    constexpr std::string_view digits = "[0-9]+$";
    if (!value.IsString() || value.GetString()[0] != '^') {
        return false;
    }
    std::string_view literal = textOf(value).substr(1);
    const bool endsInDigits = endsWith(literal, digits);
    if (!endsInDigits && !endsWith(literal, "$")) {
        return false;
    }
    literal.remove_suffix(endsInDigits ? digits.size() : 1);
    node.pattern = {literal, endsInDigits};
    return isPlain(literal);
}

bool readLimit(const JsonValue& value, double& limit) {
    // Doubles represent all integers up to here, so comparing integers as doubles is exact.
    constexpr double limitOfExactness = 9007199254740992.0;
    if (!value.IsNumber() || std::fabs(value.GetDouble()) >= limitOfExactness) {
        return false;
    }
    limit = value.GetDouble();
    return true;
}

bool readMinimum(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    return readLimit(value, node.minimum);
}

bool readMaximum(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    return readLimit(value, node.maximum);
}

bool readMinItems(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    node.minItems = value.IsUint() ? value.GetUint() : 0;
    return value.IsUint();
}

bool readItems(const JsonValue& value, Place place, SchemaNode& node) {
    node.items.push_back(compile(value, place.below()));
    return true;
}

bool readProperties(const JsonValue& value, Place place, SchemaNode& node) {
    if (!value.IsObject() || hasRepeatedName(value)) {
        return false;
    }
    node.properties.reserve(value.MemberCount());
    for (const auto& member : value.GetObject()) {
        node.properties.push_back({textOf(member.name), compile(member.value, place.below())});
    }
    return true;
}

bool readAdditionalProperties(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    node.additionalProperties = value.IsTrue();
    return value.IsBool();
}

bool readRequired(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    if (!value.IsArray()) {
        return false;
    }
    for (const JsonValue& name : value.GetArray()) {
        if (!name.IsString()) {
            return false;
        }
        node.required.push_back(textOf(name));
    }
    return true;
}

bool readOneOf(const JsonValue& value, Place place, SchemaNode& node) {
    if (!value.IsArray() || value.Empty()) {
        return false;
    }
    node.oneOf.reserve(value.Size());
    for (const JsonValue& alternative : value.GetArray()) {
        node.oneOf.push_back(compile(alternative, place));
    }
    return true;
}

// Only the schema that accepts everything can be negated.
bool readNot(const JsonValue& value, Place /*place*/, SchemaNode& node) {
    node.allowed = 0;
    return value.IsObject() && value.ObjectEmpty();
}

bool ignore(const JsonValue& /*value*/, Place /*place*/, SchemaNode& /*node*/) {
    return true;
}

bool readKeyword(std::string_view keyword, const JsonValue& value, Place place, SchemaNode& node) {
    static constexpr std::pair<std::string_view, decltype(&ignore)> readers[] = {
        {"type", readType},
        {"enum", readEnum},
        {"pattern", readPattern},
        {"minimum", readMinimum},
        {"maximum", readMaximum},
        {"minItems", readMinItems},
        {"items", readItems},
        {"properties", readProperties},
        {"additionalProperties", readAdditionalProperties},
        {"required", readRequired},
        {"oneOf", readOneOf},
        {"not", readNot},
        {"title", ignore},
        {"$schema", ignore},
        {"definitions", ignore},
        {"patternErrorDescription", ignore},
        {"minItemsErrorDescription", ignore},
        {"oneOfErrorDescription", ignore},
    };
    const auto* const reader =
        std::find_if(std::begin(readers), std::end(readers),
                     [keyword](const auto& one) { return one.first == keyword; });
    return reader != std::end(readers) && reader->second(value, place, node);
}

// Recursion ends below the depth at which containers are passed as null, as those are not checked.
SchemaNode compile(const JsonValue& schema, Place place) {
    SchemaNode node;
    if (!schema.IsObject() || hasRepeatedName(schema) || place.depth > depthPassedAsNull) {
        node.undecided = allTypes;
        return node;
    }
    if (const JsonValue* const reference = findMember(schema, "$ref")) {
        const JsonValue* const target = resolve(place.root, *reference);
        return compile(target ? *target : *reference, place);
    }
    node.undecided = place.depth == depthPassedAsNull ? containers : 0;
    for (const auto& member : schema.GetObject()) {
        if (!readKeyword(textOf(member.name), member.value, place, node)) {
            node.undecided = allTypes;
        }
    }
    return node;
}

}  // namespace

SchemaNode compileSchema(const JsonValue& schema) {
    return compile(schema, {schema, 1});
}

}  // namespace nQITRMCWEBSVC100
