#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// The maximum nesting depth of arrays and objects in a request. No request of the service needs
// more than five levels; the limit keeps recursive functions from exhausting a thread's stack.
constexpr int maxNesting = 1000;

// Parses the text of a body up to its first NUL; a number with a fraction or an exponent becomes
// the nearest double. The texts of the document are parts of a copy of the body, which the
// allocator of the document owns. Throws std::bad_alloc for a number of hundreds of millions of
// digits, and BasicError parseError with the reason and the offset in bytes if the text is not
// JSON, is nested more deeply than maxNesting, or contains a number that is too big for a double.
void parseRequestText(const std::string& body, JsonDocument& document);

}  // namespace nQITRMCWEBSVC100
