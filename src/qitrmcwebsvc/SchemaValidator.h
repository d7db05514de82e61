#pragma once

#include <memory>
#include <mutex>

#include "qitrmcwebsvc/ISchemaValidator.h"
#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// Checks the requests of one method against the method's schema, joined with the definitions that
// all schemas share. Runs of one validator follow one another; what follows a failed run, to find
// the words for it, overlaps with other runs.
class SchemaValidator : public ISchemaValidator {
  public:
    // `schemaText` is a JSON text and is not needed afterwards. Throws InternalError when it cannot
    // be used.
    explicit SchemaValidator(const char* schemaText);
    // The same with other definitions than the program's own.
    SchemaValidator(const char* schemaText, const char* definitionsText);

    void validate(const SingleRequest& request) override;

  private:
    std::shared_ptr<JsonDocument> schemaDocument;
    // Holds the memory of the definitions that the schema document took over.
    std::shared_ptr<JsonDocument> definitionsDocument;
    std::shared_ptr<JsonSchemaDocument> compiledSchema;
    std::mutex validationMutex;
};

}  // namespace nQITRMCWEBSVC100
