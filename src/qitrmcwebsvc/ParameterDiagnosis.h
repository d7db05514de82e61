#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SchemaRun.h"

namespace nQITRMCWEBSVC100 {

// The sentence that describes a failure to a client, or "" if there is none. `schema` is the
// document that the pointers of the failure refer to.
//
// A schema may name the sentence for a keyword in a member "<keyword>ErrorDescription". Throws
// InternalError if the schema itself is invalid.
std::string describeFailure(const JsonValue& schema, const SchemaFailure& failure);

// Throws BasicError invalidParams for this failure, with its sentence or, if there is none, with
// the pointers and the keyword. Throws InternalError like describeFailure.
[[noreturn]] void throwInvalidParams(const JsonValue& schema, const SchemaFailure& failure);

}  // namespace nQITRMCWEBSVC100
