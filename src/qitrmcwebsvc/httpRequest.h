#pragma once

#include <ws_runtime.h>

#include <string>
#include <string_view>

namespace nQITRMCWEBSVC100 {

// Reading of an HTTP request from the web runtime. Each read makes at most two calls of the
// runtime: the second with a buffer of the size that the first asked for. Returns 0 and fills `out`
// with the text up to its first NUL, or returns the runtime's non-zero result and leaves `out`
// alone.

int readRequestVariable(ws_Request* request, const char* name, std::string& out);
int readPostBody(ws_Request* request, std::string& out);

// Appends to the body of the response; in pieces where the runtime's 32 bits do not hold the size.
void writeOutput(ws_Request* request, std::string_view text);

}  // namespace nQITRMCWEBSVC100
