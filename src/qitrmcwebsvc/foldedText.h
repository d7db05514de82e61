#pragma once

#include <string_view>

namespace nQITRMCWEBSVC100 {

// Compares two UTF-8 texts ignoring case, by full Unicode case folding, which may expand one
// character to up to three. A byte that is not valid UTF-8 equals only itself. Does not allocate.
bool equalFolded(std::string_view left, std::string_view right);

}  // namespace nQITRMCWEBSVC100
