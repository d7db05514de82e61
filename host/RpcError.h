#pragma once

#include <string>

namespace host {

// Whether a response of the service has a JSON-RPC error: it is one, or it is a batch with one.
// Reads a response no further than necessary.
bool hasRpcError(const std::string& response);

}  // namespace host
