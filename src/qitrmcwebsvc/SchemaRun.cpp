#include "qitrmcwebsvc/SchemaRun.h"

namespace nQITRMCWEBSVC100 {
namespace {

// The depth of a request's root is 1, that of a parameter 3, and that of an element of an array
// parameter 4. The schemas ask no element to be an object or array, and tell those from a null
// nowhere. So the validator, which looks at all open containers on each value, is shown a null in
// their place: that alone makes deeply nested requests cost no more than flat ones.
constexpr int depthShownAsNull = 4;

std::string uriFragment(const JsonPointer& pointer) {
    JsonBuffer text;
    pointer.StringifyUriFragment(text);
    return std::string(text.GetString(), text.GetSize());
}

}  // namespace

SchemaRun::SchemaRun(const JsonSchemaDocument& schema)
    : validator(*new (memory.Malloc(sizeof(Validator))) Validator(schema, &memory)) {}

bool SchemaRun::accepts(const JsonValue& request) {
    return visit(request, 1);
}

bool SchemaRun::visit(const JsonValue& value, int depth) {
    const bool isContainer = value.IsObject() || value.IsArray();
    if (isContainer && depth >= depthShownAsNull)
        return validator.Null();
    if (value.IsObject())
        return visitObject(value, depth);
    if (value.IsArray())
        return visitArray(value, depth);
    return value.Accept(validator);
}

bool SchemaRun::visitObject(const JsonValue& object, int depth) {
    if (!validator.StartObject())
        return false;
    for (const auto& member : object.GetObject()) {
        if (!validator.Key(member.name.GetString(), member.name.GetStringLength(), false) ||
            !visit(member.value, depth + 1))
            return false;
    }
    return validator.EndObject(object.MemberCount());
}

bool SchemaRun::visitArray(const JsonValue& array, int depth) {
    if (!validator.StartArray())
        return false;
    for (const JsonValue& element : array.GetArray()) {
        if (!visit(element, depth + 1))
            return false;
    }
    return validator.EndArray(array.Size());
}

SchemaFailure SchemaRun::failure() const {
    const char* const keyword = validator.GetInvalidSchemaKeyword();
    return {uriFragment(validator.GetInvalidDocumentPointer()),
            uriFragment(validator.GetInvalidSchemaPointer()), keyword ? keyword : ""};
}

}  // namespace nQITRMCWEBSVC100
