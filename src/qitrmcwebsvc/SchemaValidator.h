#pragma once

#include <memory>
#include <mutex>
#include <optional>

#include "qitrmcwebsvc/ISchemaValidator.h"
#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SchemaPrecheck.h"

namespace nQITRMCWEBSVC100 {

// Checks the requests of one method against the method's schema, merged with the definitions that
// all schemas share. Most valid requests pass a check of its own, which needs no lock. For all
// others the JSON library decides: its runs on one validator are serialised; producing the error
// text after a failed run is not.
class SchemaValidator : public ISchemaValidator {
  public:
    // `schemaText` is a JSON text, which is not kept. Throws InternalError if it is not a valid
    // schema.
    explicit SchemaValidator(const char* schemaText);
    // The same with other definitions than the embedded ones.
    SchemaValidator(const char* schemaText, const char* definitionsText);

    void validate(const SingleRequest& request) override;

  private:
    std::shared_ptr<JsonDocument> schemaDocument;
    // Owns the memory of the definitions that were moved into the schema document.
    std::shared_ptr<JsonDocument> definitionsDocument;
    std::shared_ptr<JsonSchemaDocument> compiledSchema;
    std::optional<const SchemaPrecheck> precheck;
    std::mutex validationMutex;
};

}  // namespace nQITRMCWEBSVC100
