#pragma once

#include <cstdint>
#include <string_view>

namespace nQITRMCWEBSVC100 {

// Compares two UTF-8 texts ignoring case, by full Unicode case folding, which may expand one
// character to up to three. A byte that is not valid UTF-8 equals only itself. Does not allocate.
bool equalFolded(std::string_view left, std::string_view right);

// The same for texts that are equal so. Does not allocate.
std::uint32_t hashFolded(std::string_view text);

}  // namespace nQITRMCWEBSVC100
