#include "qitrmcwebsvc/SchemaPrecheck.h"

#include <algorithm>
#include <string_view>
#include <vector>

namespace nQITRMCWEBSVC100 {
namespace {

using Verdict = SchemaPrecheck::Verdict;

Verdict check(const SchemaNode& schema, const JsonValue& value);

// No match is Undecided, as the library's pattern engine reads a text only up to its first NUL or
// invalid byte.
Verdict checkString(const SchemaNode& schema, const JsonValue& value) {
    if (!schema.pattern) {
        return Verdict::Valid;
    }
    const auto& [literal, endsInDigits] = *schema.pattern;
    const std::string_view text = textOf(value);
    if (text.substr(0, literal.size()) != literal) {
        return Verdict::Undecided;
    }
    const std::string_view rest = text.substr(literal.size());
    const bool allDigits =
        std::all_of(rest.begin(), rest.end(), [](char c) { return c >= '0' && c <= '9'; });
    return rest.empty() != endsInDigits && allDigits ? Verdict::Valid : Verdict::Undecided;
}

// The limits are so small that a 64-bit integer is beyond one of them if and only if its nearest
// double is.
Verdict checkNumber(const SchemaNode& schema, const JsonValue& value) {
    const double number = value.GetDouble();
    const bool beyond = number < schema.minimum || number > schema.maximum;
    return beyond ? Verdict::Invalid : Verdict::Valid;
}

Verdict checkArray(const SchemaNode& schema, const JsonValue& array) {
    if (array.Size() < schema.minItems) {
        return Verdict::Invalid;
    }
    for (const SchemaNode& items : schema.items) {
        for (const JsonValue& element : array.GetArray()) {
            const Verdict verdict = check(items, element);
            if (verdict != Verdict::Valid) {
                return verdict;
            }
        }
    }
    return Verdict::Valid;
}

// An unknown member that is not allowed is Undecided, as the library knows the names in `required`
// too.
Verdict checkMember(const SchemaNode& schema, std::string_view name, const JsonValue& value) {
    for (const SchemaProperty& property : schema.properties) {
        if (property.name == name) {
            return check(property.schema, value);
        }
    }
    return schema.additionalProperties ? Verdict::Valid : Verdict::Undecided;
}

bool hasMember(const JsonValue& object, std::string_view name) {
    return std::any_of(object.MemberBegin(), object.MemberEnd(),
                       [name](const auto& member) { return textOf(member.name) == name; });
}

// Of members with the same name each one is checked, as the library does.
Verdict checkObject(const SchemaNode& schema, const JsonValue& object) {
    for (const std::string_view name : schema.required) {
        if (!hasMember(object, name)) {
            return Verdict::Invalid;
        }
    }
    for (const auto& member : object.GetObject()) {
        const Verdict verdict = checkMember(schema, textOf(member.name), member.value);
        if (verdict != Verdict::Valid) {
            return verdict;
        }
    }
    return Verdict::Valid;
}

Verdict checkContent(const SchemaNode& schema, const JsonValue& value) {
    switch (value.GetType()) {
        case rapidjson::kStringType:
            return checkString(schema, value);
        case rapidjson::kNumberType:
            return checkNumber(schema, value);
        case rapidjson::kArrayType:
            return checkArray(schema, value);
        case rapidjson::kObjectType:
            return checkObject(schema, value);
        default:
            return Verdict::Valid;
    }
}

// Any other value is Undecided, as the library compares hashes, by which a double may equal an
// integer.
bool isListed(const JsonValue& enumeration, const JsonValue& value) {
    for (const JsonValue& entry : enumeration.GetArray()) {
        if (!value.IsDouble() && entry == value) {
            return true;
        }
    }
    return false;
}

Verdict checkOneOf(const std::vector<SchemaNode>& alternatives, const JsonValue& value) {
    int valid = 0;
    for (const SchemaNode& alternative : alternatives) {
        const Verdict verdict = check(alternative, value);
        if (verdict == Verdict::Undecided) {
            return verdict;
        }
        valid += verdict == Verdict::Valid ? 1 : 0;
    }
    return valid == 1 ? Verdict::Valid : Verdict::Invalid;
}

Verdict check(const SchemaNode& schema, const JsonValue& value) {
    const unsigned type = typeBit(value);
    if ((schema.undecided & type) != 0) {
        return Verdict::Undecided;
    }
    if ((schema.allowed & type) == 0) {
        return Verdict::Invalid;
    }
    if (schema.enumeration != nullptr && !isListed(*schema.enumeration, value)) {
        return Verdict::Undecided;
    }
    const Verdict verdict = checkContent(schema, value);
    if (verdict != Verdict::Valid || schema.oneOf.empty()) {
        return verdict;
    }
    return checkOneOf(schema.oneOf, value);
}

}  // namespace

SchemaPrecheck::SchemaPrecheck(const JsonValue& schema) : root(compileSchema(schema)) {}

SchemaPrecheck::Verdict SchemaPrecheck::verdictOn(const JsonValue& request) const {
    return check(root, request);
}

}  // namespace nQITRMCWEBSVC100
