#include "qitrmcwebsvc/httpRequest.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <limits>
#include <utility>

namespace nQITRMCWEBSVC100 {
namespace {

constexpr std::size_t firstVariableSize = 32;
constexpr std::size_t firstBodySize = 256;
constexpr std::size_t mostOutput = std::numeric_limits<std::uint32_t>::max();

// `read` takes a buffer and a pointer to its size. A completely filled buffer has no NUL.
template <std::size_t firstSize, typename Read>
int readText(std::string& out, Read read) {
    std::array<char, firstSize> first{};
    std::uint32_t size = firstSize;
    int result = read(first.data(), &size);
    if (result == 0) {
        out.assign(first.data(), strnlen(first.data(), firstSize));
        return 0;
    }
    if (size == 0) {
        return result;
    }
    std::string buffer(size, '\0');
    result = read(buffer.data(), &size);
    if (result == 0) {
        buffer.resize(strnlen(buffer.data(), buffer.size()));
        out = std::move(buffer);
    }
    return result;
}

}  // namespace

int readRequestVariable(ws_Request* request, const char* name, std::string& out) {
    return readText<firstVariableSize>(out, [&](char* buffer, std::uint32_t* size) {
        return ReadRequestVariable_C_REST_QI_QVWS_(request, name, buffer, size);
    });
}

int readPostBody(ws_Request* request, std::string& out) {
    return readText<firstBodySize>(out, [&](char* buffer, std::uint32_t* size) {
        return ReadPostData_C_REST_QI_QVWS_(request, buffer, size);
    });
}

void writeOutput(ws_Request* request, std::string_view text) {
    do {
        const auto size = static_cast<std::uint32_t>(std::min(text.size(), mostOutput));
        WriteOutput_C_REST_QI_QVWS_(request, text.data(), size);
        text.remove_prefix(size);
    } while (!text.empty());
}

}  // namespace nQITRMCWEBSVC100
