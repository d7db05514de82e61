#pragma once

#include <utf8proc.h>

#include <cstddef>
#include <string_view>

// Reading of UTF-8 that may be invalid. Shared by the plug-in, the simulator and the host.
namespace common {

struct Utf8Character {
    std::string_view bytes;
    utf8proc_int32_t codePoint;

    bool isValid() const { return codePoint >= 0; }
};

// Removes the first character from `text`, which must not be empty. A byte at which no valid
// sequence begins is one invalid character.
inline Utf8Character takeCharacter(std::string_view& text) {
    utf8proc_int32_t codePoint = 0;
    const utf8proc_ssize_t length =
        utf8proc_iterate(reinterpret_cast<const utf8proc_uint8_t*>(text.data()),
                         static_cast<utf8proc_ssize_t>(text.size()), &codePoint);
    const std::size_t taken = length > 0 ? static_cast<std::size_t>(length) : 1;
    const Utf8Character character{text.substr(0, taken), length > 0 ? codePoint : -1};
    text.remove_prefix(taken);
    return character;
}

}  // namespace common
