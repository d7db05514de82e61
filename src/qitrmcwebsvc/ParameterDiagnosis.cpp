#include "qitrmcwebsvc/ParameterDiagnosis.h"

#include <boost/algorithm/string/replace.hpp>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/compactJson.h"
#include "qitrmcwebsvc/findMember.h"
#include "qitrmcwebsvcerr/ErrorDescriptions.h"

namespace nQITRMCWEBSVC100 {
namespace {

using nQITRMCSHAREDCMN100::BasicError;
using nQITRMCSHAREDCMN100::InternalError;

const JsonValue* resolve(const JsonValue& schema, const std::string& pointerText) {
    const JsonPointer pointer(pointerText.data(), pointerText.size());
    return pointer.IsValid() ? pointer.Get(schema) : nullptr;
}

const JsonValue* memberOfObject(const JsonValue* object, const std::string& name) {
    if (!object || !object->IsObject()) {
        return nullptr;
    }
    return findMember(*object, name.c_str());
}

// String replacement instead of a stream: streams use caches of the global locale, which are filled
// without a lock.
std::string filledIn(const char* descriptionName, const std::string& value) {
    return boost::algorithm::replace_first_copy(getErrorDescription(descriptionName), "%s", value);
}

// The value of the failed keyword in the schema.
const JsonValue& keywordValue(const JsonValue& schema, const SchemaFailure& failure) {
    const JsonValue* const value = resolve(schema, failure.schemaPointer + "/" + failure.keyword);
    if (!value) {
        throw InternalError("Invalid schema format.", QITRMC_HERE);
    }
    return *value;
}

std::string stringOf(const JsonValue& value) {
    if (!value.IsString()) {
        throw InternalError("Invalid schema format.", QITRMC_HERE);
    }
    return value.GetString();
}

std::string enumEntry(const JsonValue& entry) {
    if (entry.IsInt()) {
        return std::to_string(entry.GetInt());
    }
    if (entry.IsString()) {
        return entry.GetString();
    }
    throw InternalError("Unsupported data type for enums.", QITRMC_HERE);
}

std::string joined(const JsonValue& array, std::string (*textOf)(const JsonValue&)) {
    if (!array.IsArray()) {
        throw InternalError("Invalid schema format.", QITRMC_HERE);
    }
    std::string text;
    for (const JsonValue& entry : array.GetArray()) {
        if (&entry != array.Begin()) {
            text += ", ";
        }
        text += textOf(entry);
    }
    return text;
}

std::string describeKeyword(const JsonValue& schema, const SchemaFailure& failure) {
    const std::string& keyword = failure.keyword;
    const auto value = [&]() -> const JsonValue& { return keywordValue(schema, failure); };

    if (keyword == "type") {
        return filledIn("WrongParameterType", stringOf(value()));
    }
    if (keyword == "required") {
        return filledIn("ParameterRequired", joined(value(), stringOf));
    }
    if (keyword == "enum") {
        return filledIn("InvalidEnumItem", joined(value(), enumEntry));
    }
    if (keyword == "additionalProperties") {
        return getErrorDescription("UnsupportedParams");
    }
    if (keyword == "minimum") {
        return filledIn("LessThanMinValue", compactJson(value()));
    }
    if (keyword == "maximum") {
        return filledIn("GreaterThanMaxValue", compactJson(value()));
    }
    return "";
}

}  // namespace

std::string describeFailure(const JsonValue& schema, const SchemaFailure& failure) {
    const JsonValue* const broken = resolve(schema, failure.schemaPointer);
    if (!memberOfObject(broken, failure.keyword)) {
        return "";
    }

    const JsonValue* const name = memberOfObject(broken, failure.keyword + "ErrorDescription");
    if (name && name->IsString()) {
        return getErrorDescription(name->GetString());
    }
    return describeKeyword(schema, failure);
}

void throwInvalidParams(const JsonValue& schema, const SchemaFailure& failure) {
    const std::string details = describeFailure(schema, failure);
    const char* const documentPointer = failure.documentPointer.c_str();

    BasicError error(qierr::codes::invalidParams, QITRMC_HERE);
    qierr_Writer writer = error.details();
    if (!details.empty()) {
        writer = addUsageString(writer, "kUsageTypeParameter", documentPointer);
        addUsageString(writer, "kUsageTypeDetails", details.c_str());
    } else {
        writer = addUsageString(writer, "kUsageTypeJsonDocPointer", documentPointer);
        writer = addUsageString(writer, "kUsageTypeJsonSchemaKeyword", failure.keyword.c_str());
        addUsageString(writer, "kUsageTypeJsonSchemaPointer", failure.schemaPointer.c_str());
    }
    throw error;
}

}  // namespace nQITRMCWEBSVC100
