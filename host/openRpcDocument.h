#pragma once

#include <string_view>

namespace host {

// The description of the service for machines, docs/openrpc.json.
extern const std::string_view openRpcDocument;

}  // namespace host
