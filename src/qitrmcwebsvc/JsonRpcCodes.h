#pragma once

#include <cstdint>

namespace nQITRMCWEBSVC100 {

// Codes of the JSON-RPC protocol that statuses of the service bear.
constexpr std::int32_t parseErrorCode = -32700;
constexpr std::int32_t invalidRequestCode = -32600;
constexpr std::int32_t unknownMethodCode = -32601;
constexpr std::int32_t invalidParamsCode = -32602;
// Raised nowhere in the service; one from a layer below passes through.
constexpr std::int32_t protocolInternalCode = -32603;
constexpr std::int32_t serverErrorCode = -32000;
// An element of a batch that was not run, because one before it failed.
constexpr std::int32_t skippedCode = -32001;

}  // namespace nQITRMCWEBSVC100
