#pragma once

#include <string_view>

namespace nQITRMCWEBSVC100 {

// Whether two UTF-8 texts are equal without regard to case, by full Unicode case folding, in which
// one letter may stand for up to three. Bytes that are no UTF-8 are equal to themselves only.
// Allocates nothing.
bool equalFolded(std::string_view left, std::string_view right);

}  // namespace nQITRMCWEBSVC100
