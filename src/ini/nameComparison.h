#pragma once

#include <algorithm>
#include <string>
#include <string_view>

namespace ini {

inline constexpr std::string_view blanks = " \t\v\f";

inline std::string_view withoutLeadingBlanks(std::string_view text) {
    const std::size_t begin = text.find_first_not_of(blanks);
    return begin == text.npos ? std::string_view() : text.substr(begin);
}

inline std::string_view withoutTrailingBlanks(std::string_view text) {
    return text.substr(0, text.find_last_not_of(blanks) + 1);
}

inline char lowered(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

// The form in which names of sections and keys are compared: without leading blanks, and in lower
// case if case is ignored.
inline std::string folded(std::string_view name, bool ignoreCase) {
    std::string result(withoutLeadingBlanks(name));
    if (ignoreCase) {
        std::transform(result.begin(), result.end(), result.begin(), lowered);
    }
    return result;
}

inline bool sameName(std::string_view a, std::string_view b) {
    a = withoutLeadingBlanks(a);
    b = withoutLeadingBlanks(b);
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [](char x, char y) { return lowered(x) == lowered(y); });
}

}  // namespace ini
