#pragma once

#include <ws_runtime.h>

#include <optional>
#include <string_view>
#include <vector>

namespace host {

// The entry that the path of a request names, decoded to one number for each character:
// "/qitrmc/Call" gives "Call". Nothing for a path that is not /qitrmc/ and one segment.
//
// `path` is the target of the request without its query: a path, or the absolute form that clients
// send to proxies. A "%" without two hexadecimal digits stands for itself; a byte that is not part
// of UTF-8 text becomes U+FFFD.
std::optional<std::vector<std::uint32_t>> entryNameOfPath(std::string_view path);

// The entry object that a plug-in is given. It must not outlive `name` and stays where it is made.
class Entry : public ws_Entry {
  public:
    explicit Entry(const std::vector<std::uint32_t>& name);
    Entry(const Entry&) = delete;
    Entry& operator=(const Entry&) = delete;

    const std::vector<std::uint32_t>& name;
};

}  // namespace host
