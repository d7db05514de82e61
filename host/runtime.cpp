#include <cstring>
#include <new>
#include <stdexcept>
#include <string_view>

#include "host/Request.h"

namespace {

constexpr int read = 0;
constexpr int notRead = 1;

const std::string* findVariable(const ws_Request& request, std::string_view name) {
    if (name == "REQUEST_TRANSPORT") {
        return &request.transport;
    }
    if (name == "REQUEST_METHOD") {
        return &request.method;
    }
    return nullptr;
}

// Lets `write` extend the response. A plug-in is C to its server, so no exception may reach it;
// the host does not send a response that misses a piece.
template <typename Write>
void extendResponse(ws_Request& request, Write write) noexcept {
    try {
        write();
    } catch (const std::bad_alloc&) {
        request.incomplete = true;
    } catch (const std::length_error&) {
        request.incomplete = true;
    }
}

}  // namespace

extern "C" {

int ReadRequestVariable_C_REST_QI_QVWS_(ws_Request* request, const char* name, char* buffer,
                                        std::uint32_t* size) {
    const std::string* value = findVariable(*request, name);
    if (value == nullptr) {
        *size = 0;
        return notRead;
    }
    const std::size_t needed = value->size() + 1;
    if (*size < needed) {
        *size = static_cast<std::uint32_t>(needed);
        return notRead;
    }
    std::memcpy(buffer, value->c_str(), needed);
    return read;
}

int ReadPostData_C_REST_QI_QVWS_(ws_Request* request, char* buffer, std::uint32_t* size) {
    const std::string& body = request->body;
    if (*size < body.size()) {
        *size = static_cast<std::uint32_t>(body.size());
        return notRead;
    }
    if (!body.empty()) {
        std::memcpy(buffer, body.data(), body.size());
    }
    if (*size > body.size()) {
        buffer[body.size()] = '\0';
    }
    return read;
}

void SetHTTPResponseCode_QI_QVWS_(ws_Request* request, int code) {
    request->code = code;
}

void SetHTTPResponseMimeType_C_REST_QI_QVWS_(ws_Request* request, const char* type) {
    extendResponse(*request, [&] { request->type = type; });
}

void WriteOutput_C_REST_QI_QVWS_(ws_Request* request, const char* data, std::uint32_t length) {
    extendResponse(*request, [&] { request->output.append(data, length); });
}

}  // extern "C"
