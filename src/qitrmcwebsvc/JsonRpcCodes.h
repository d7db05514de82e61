#pragma once

#include <cstdint>

namespace nQITRMCWEBSVC100 {

// Codes of the JSON-RPC protocol that statuses of the service bear.
constexpr std::int32_t invalidRequestCode = -32600;
constexpr std::int32_t invalidParamsCode = -32602;

}  // namespace nQITRMCWEBSVC100
