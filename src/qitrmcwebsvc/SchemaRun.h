#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/RunMemory.h"

namespace nQITRMCWEBSVC100 {

// Where and why a request broke its schema. Both pointers are JSON pointers in URI fragment form.
struct SchemaFailure {
    std::string documentPointer;  // the value or member that is wrong
    std::string schemaPointer;    // the schema that it broke, "#" when there is none
    std::string keyword;          // the keyword that it broke, empty when there is none
};

// One run of one request against one compiled schema. The time it takes grows linearly with the
// size of the request, and its use of the call stack is bounded.
class SchemaRun {
  public:
    // `schema` must outlive the run.
    explicit SchemaRun(const JsonSchemaDocument& schema);

    // Whether `request` conforms. To be called once. Schemas share scratch memory with their runs:
    // at most one thread may be in this function for a schema at a time.
    bool accepts(const JsonValue& request);

    // The first failure. Only for a run that did not accept; needs no lock.
    SchemaFailure failure() const;

  private:
    using Validator =
        rapidjson::GenericSchemaValidator<JsonSchemaDocument,
                                          rapidjson::BaseReaderHandler<JsonEncoding>, RunMemory>;

    bool visit(const JsonValue& value, int depth);
    bool visitBrokenOff(const JsonValue& text);
    bool visitObject(const JsonValue& object, int depth);
    bool visitArray(const JsonValue& array, int depth);

    RunMemory memory;
    Validator& validator;  // lives in `memory`, which ends it without destroying it
};

}  // namespace nQITRMCWEBSVC100
