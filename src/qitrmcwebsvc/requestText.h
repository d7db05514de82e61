#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// How deep arrays and objects may nest in a request. No request of the service needs more than
// five levels; the limit keeps recursive work on a request far from the end of a thread's stack.
constexpr int maxNesting = 1000;

// Parses the text of a body up to its first NUL; a number with a fraction or an exponent becomes
// the nearest double. Throws std::bad_alloc for a number of hundreds of millions of digits, and
// BasicError parseError with the reason and the offset in bytes when it is not JSON, nests deeper
// than maxNesting, or holds a number too big for a double.
void parseRequestText(const std::string& body, JsonDocument& document);

}  // namespace nQITRMCWEBSVC100
