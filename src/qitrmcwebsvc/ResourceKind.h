#pragma once

#include <cstdint>

namespace nQITRMCWEBSVC100 {

// The kind of resources that a request or a session uses.
enum class ResourceKind : std::int32_t {
    None = 0,
    Device = 1,
    PhysicalChannel = 2,
    NvmemArea = 3,
};

}  // namespace nQITRMCWEBSVC100
