#include <map>
#include <memory>

#include "embedded/EmbeddedFiles.h"
#include "harnesses.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SchemaPrecheck.h"
#include "qitrmcwebsvc/SchemaRun.h"
#include "qitrmcwebsvc/SchemaValidator.h"
#include "qitrmcwebsvc/requestText.h"

namespace {

using namespace nQITRMCWEBSVC100;
using nQITRMCSHAREDCMN100::BasicError;

// A schema with the definitions.
struct Merged {
    explicit Merged(const char* text) {
        schema.Parse(text);
        definitions.Parse(embeddedText("definitions.json"));
        schema.AddMember("definitions", definitions["definitions"], schema.GetAllocator());
    }

    const JsonValue& params() const { return schema["properties"]["params"]; }

    JsonDocument schema;
    JsonDocument definitions;
};

// A schema, its validator, and what that consists of.
struct Checked {
    explicit Checked(const char* text)
        : validator(text), merged(text), precheck(merged.schema), compiled(merged.schema) {}

    SchemaValidator validator;
    Merged merged;
    SchemaPrecheck precheck;
    JsonSchemaDocument compiled;
};

std::map<std::string, Checked, std::less<>> checkedSchemas() {
    const std::string prefix = "procedure_";
    const std::string suffix = ".json";
    std::map<std::string, Checked, std::less<>> all;
    for (const EmbeddedFile& file : embeddedFiles()) {
        const std::string name = file.name;
        if (name.compare(0, prefix.size(), prefix) == 0) {
            all.try_emplace(name.substr(prefix.size(), name.size() - prefix.size() - suffix.size()),
                            file.data);
        }
    }
    return all;
}

// What holds for every accepted request, whichever engine checked it.
void requireConformity(const JsonValue& params, const JsonValue& schema) {
    fuzz::require(params.IsObject(), "params of a wrong type were accepted");
    for (const auto& member : params.GetObject()) {
        fuzz::require(schema["properties"].HasMember(member.name),
                      "an unknown member was accepted");
    }
    const auto required = schema.FindMember("required");
    if (required == schema.MemberEnd()) {
        return;
    }
    for (const JsonValue& name : required->value.GetArray()) {
        fuzz::require(params.HasMember(name), "a missing member was accepted");
    }
}

// Wherever the precheck decides, the JSON library agrees.
void requireAgreement(const Checked& checked, const JsonValue& request) {
    const SchemaPrecheck::Verdict verdict = checked.precheck.verdictOn(request);
    const bool accepted = SchemaRun(checked.compiled).accepts(request);
    fuzz::require(accepted || verdict != SchemaPrecheck::Verdict::Valid,
                  "the precheck takes an invalid request for valid");
    fuzz::require(!accepted || verdict != SchemaPrecheck::Verdict::Invalid,
                  "the precheck takes a valid request for invalid");
}

void validate(Checked& checked, const SingleRequest& request) {
    try {
        checked.validator.validate(request);
    } catch (const BasicError& error) {
        const std::int32_t code = error.status()->code;
        fuzz::require(code == -32600 || code == -32602, "refused with a wrong code");
        return;
    }
    requireConformity(request.getParams(), checked.merged.params());
}

}  // namespace

void fuzz::validateSchema(std::string_view input) {
    const std::size_t newline = input.find('\n');
    static auto schemas = checkedSchemas();
    const auto checked = schemas.find(input.substr(0, newline));
    if (checked == schemas.end() || newline == input.npos) {
        return;
    }
    JsonDocument document;
    std::unique_ptr<SingleRequest> request;
    try {
        parseRequestText(std::string(input.substr(newline + 1)), document);
        request = std::make_unique<SingleRequest>(document);
    } catch (const BasicError& error) {
        const std::int32_t code = error.status()->code;
        require(code == -32600 || code == -32700, "refused with a wrong code");
        return;
    }
    requireAgreement(checked->second, request->getRequest());
    validate(checked->second, *request);
}
