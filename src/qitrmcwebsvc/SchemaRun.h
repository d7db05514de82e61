#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/RunMemory.h"

namespace nQITRMCWEBSVC100 {

// The depth of a request's root is 1, of a parameter 3, of an element of an array parameter 4. The
// schemas do not allow an object or array as an element, and treat it like a null. For each value
// the validator visits all open containers, so passing it a null for each container at this depth
// keeps the cost of deeply nested requests linear.
constexpr int depthPassedAsNull = 4;

// Where and why a request violates its schema. Both pointers are JSON pointers in URI fragment
// form.
struct SchemaFailure {
    std::string documentPointer;  // the invalid value or member
    std::string schemaPointer;    // the violated schema, "#" if there is none
    std::string keyword;          // the violated keyword, empty if there is none
};

// Validates one request against one compiled schema. The time is linear in the size of the request,
// and the use of the call stack is bounded.
class SchemaRun {
  public:
    // `schema` must outlive the run.
    explicit SchemaRun(const JsonSchemaDocument& schema);

    // Whether `request` is valid. To be called once. The run uses memory of the schema, so only one
    // thread at a time may call this function for a schema.
    bool accepts(const JsonValue& request);

    // The first failure, if accepts() returned false. May run concurrently with other runs.
    SchemaFailure failure() const;

  private:
    using Validator =
        rapidjson::GenericSchemaValidator<JsonSchemaDocument,
                                          rapidjson::BaseReaderHandler<JsonEncoding>, RunMemory>;

    bool visit(const JsonValue& value, int depth);
    bool visitTruncatedText(const JsonValue& text);
    bool visitObject(const JsonValue& object, int depth);
    bool visitArray(const JsonValue& array, int depth);

    RunMemory memory;
    Validator& validator;  // allocated in `memory`, which frees it without calling its destructor
};

}  // namespace nQITRMCWEBSVC100
