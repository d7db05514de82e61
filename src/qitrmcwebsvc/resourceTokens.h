#pragma once

#include <string_view>

#include "qitrmcwebsvc/ResourceKind.h"

// A token is a name in a list of resources that stands for a list that the driver maintains, for
// example the default devices of the session. Any thread may call these functions.
namespace nQITRMCWEBSVC100 {

// The session property that contains the list; null for a name that is not a token.
const char* propertyOfToken(std::string_view name);

// The token for a session's default resources of this kind; null for ResourceKind::None.
const char* defaultTokenOf(ResourceKind kind);

}  // namespace nQITRMCWEBSVC100
