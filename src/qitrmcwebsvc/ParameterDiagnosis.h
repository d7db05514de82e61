#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SchemaRun.h"

namespace nQITRMCWEBSVC100 {

// The sentence that tells a client what is wrong, or "" when none is known. `schema` is the
// document that the pointers of the failure refer to.
//
// Besides the standard keywords it reads the schema's own "<keyword>ErrorDescription" members, each
// of which names a sentence. Throws InternalError when the schema itself is at fault.
std::string describeFailure(const JsonValue& schema, const SchemaFailure& failure);

// Throws the BasicError with invalidParams for this failure: with its sentence or, where none
// is known, with its raw facts. Throws InternalError as describeFailure.
[[noreturn]] void throwInvalidParams(const JsonValue& schema, const SchemaFailure& failure);

}  // namespace nQITRMCWEBSVC100
