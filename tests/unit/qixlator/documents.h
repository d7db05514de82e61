// The text of explanation files.
#pragma once

#include <string>

inline constexpr const char* heading = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<qidocument>\n";

inline std::string document(const std::string& body) {
    return heading + body + "</qidocument>\n";
}

inline std::string block(const std::string& code, const std::string& text) {
    return "<qierror code=\"" + code + "\">\n" + text + "</qierror>\n";
}
