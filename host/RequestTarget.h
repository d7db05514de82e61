#pragma once

#include <string>
#include <string_view>

namespace host {

// The path of a request's target, which is a path or the absolute form that clients send to
// proxies. The target has no query.
std::string_view pathOfTarget(std::string_view target);

// The text with its escapes, "%" and two hexadecimal digits, as the bytes that they stand for. A
// "%" without two such digits stands for itself.
std::string percentDecoded(std::string_view text);

}  // namespace host
