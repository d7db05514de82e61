#include "qitrmcwebsvc/SchemaValidator.h"

#include "embedded/EmbeddedFiles.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/ParameterDiagnosis.h"
#include "qitrmcwebsvc/SchemaRun.h"

namespace nQITRMCWEBSVC100 {
namespace {

using nQITRMCSHAREDCMN100::BasicError;
using nQITRMCSHAREDCMN100::InternalError;

void requireParamsObject(const SingleRequest& request) {
    if (request.getParams().IsObject()) {
        return;
    }
    BasicError error(qierr::codes::invalidRequest, QITRMC_HERE);
    addUsageString(error.details(), "kUsageTypeInvalidMember", "params");
    throw error;
}

}  // namespace

SchemaValidator::SchemaValidator(const char* schemaText)
    : SchemaValidator(schemaText, embeddedText("definitions.json")) {}

SchemaValidator::SchemaValidator(const char* schemaText, const char* definitionsText)
    : schemaDocument(std::make_shared<JsonDocument>()),
      definitionsDocument(std::make_shared<JsonDocument>()) {
    schemaDocument->Parse(schemaText);
    if (schemaDocument->HasParseError() || !schemaDocument->IsObject()) {
        throw InternalError("Fail to parse schema.", QITRMC_HERE);
    }

    definitionsDocument->Parse(definitionsText);
    if (definitionsDocument->HasParseError() || !definitionsDocument->IsObject() ||
        !definitionsDocument->HasMember("definitions")) {
        throw InternalError("Fail to parse definition schema.", QITRMC_HERE);
    }

    schemaDocument->AddMember("definitions", (*definitionsDocument)["definitions"],
                              schemaDocument->GetAllocator());
    compiledSchema = std::make_shared<JsonSchemaDocument>(*schemaDocument);
    precheck.emplace(*schemaDocument);
}

void SchemaValidator::validate(const SingleRequest& request) {
    requireParamsObject(request);
    if (!schemaDocument || !compiledSchema || !precheck) {
        throw InternalError("Fail to initialize validator.", QITRMC_HERE);
    }
    if (precheck->verdictOn(request.getRequest()) == SchemaPrecheck::Verdict::Valid) {
        return;
    }

    std::unique_lock<std::mutex> lock(validationMutex);
    SchemaRun run(*compiledSchema);
    const bool accepted = run.accepts(request.getRequest());
    lock.unlock();

    if (!accepted) {
        throwInvalidParams(*schemaDocument, run.failure());
    }
}

}  // namespace nQITRMCWEBSVC100
