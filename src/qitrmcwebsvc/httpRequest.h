#pragma once

#include <ws_runtime.h>

#include <string>
#include <string_view>

namespace nQITRMCWEBSVC100 {

// Reading of an HTTP request from the web runtime. Each function calls the runtime at most twice,
// the second time with a buffer of the size that the first call returned. Returns 0 and sets `out`
// to the text up to its first NUL, or returns the runtime's non-zero result and does not change
// `out`.

int readRequestVariable(ws_Request* request, const char* name, std::string& out);
int readPostBody(ws_Request* request, std::string& out);

// Appends to the body of the response, in several calls if the size does not fit into 32 bits.
void writeOutput(ws_Request* request, std::string_view text);

}  // namespace nQITRMCWEBSVC100
