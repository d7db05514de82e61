#include "host/RequestTarget.h"

#include "common/digits.h"

namespace host {

using common::hexDigit;

std::string_view pathOfTarget(std::string_view target) {
    if (target.empty() || target.front() == '/') {
        return target;
    }
    const std::size_t scheme = target.find("://");
    if (scheme == std::string_view::npos) {
        return target;
    }
    const std::size_t path = target.find('/', scheme + 3);
    return path == std::string_view::npos ? std::string_view("/") : target.substr(path);
}

std::string percentDecoded(std::string_view text) {
    std::string decoded;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool escape = text[i] == '%' && i + 2 < text.size() && hexDigit(text[i + 1]) >= 0 &&
                            hexDigit(text[i + 2]) >= 0;
        if (!escape) {
            decoded += text[i];
            continue;
        }
        decoded += static_cast<char>(hexDigit(text[i + 1]) * 16 + hexDigit(text[i + 2]));
        i += 2;
    }
    return decoded;
}

}  // namespace host
