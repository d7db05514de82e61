#include "support/FakeWebRuntime.h"

#include <cstring>

#include "support/FaultFree.h"

namespace {

constexpr int tooSmall = 7;

// A text that fills the buffer exactly gets no NUL after it.
int fill(const std::string& text, char* buffer, std::uint32_t* size) {
    if (text.size() > *size) {
        *size = static_cast<std::uint32_t>(text.size());
        return tooSmall;
    }
    std::memcpy(buffer, text.data(), text.size());
    if (text.size() < *size) {
        buffer[text.size()] = '\0';
    }
    return 0;
}

int fail(std::uint32_t* size) {
    *size = 0;
    return tooSmall;
}

ws_WideString nameOf(const ws_Entry* entry) {
    const std::u32string& name = static_cast<const FakeEntry*>(entry)->name;
    const auto* begin = reinterpret_cast<const std::uint32_t*>(name.data());
    return {begin, begin + name.size()};
}

void unused(ws_Entry*) {}

constexpr ws_EntryOperations operationsOfAll = {unused, unused, unused, nameOf};

}  // namespace

FakeEntry::FakeEntry(const std::u32string& entryName) : name(entryName) {
    operations = &operationsOfAll;
}

extern "C" {

int ReadRequestVariable_C_REST_QI_QVWS_(ws_Request* request, const char* name, char* buffer,
                                        std::uint32_t* size) {
    const FaultFree spared;
    request->variableBufferSizes.push_back(*size);
    const auto found = request->variables.find(name);
    return found == request->variables.end() ? fail(size) : fill(found->second, buffer, size);
}

int ReadPostData_C_REST_QI_QVWS_(ws_Request* request, char* buffer, std::uint32_t* size) {
    const FaultFree spared;
    request->bodyBufferSizes.push_back(*size);
    if (!request->bodyReadable) {
        return fail(size);
    }
    if (request->bodyFailsForGood && request->bodyBufferSizes.size() == 2) {
        return tooSmall;
    }
    return fill(request->body, buffer, size);
}

void SetHTTPResponseCode_QI_QVWS_(ws_Request* request, int code) {
    const FaultFree spared;
    request->done.push_back("code " + std::to_string(code));
}

void SetHTTPResponseMimeType_C_REST_QI_QVWS_(ws_Request* request, const char* type) {
    const FaultFree spared;
    request->done.push_back(std::string("type ") + type);
}

void WriteOutput_C_REST_QI_QVWS_(ws_Request* request, const char* data, std::uint32_t length) {
    const FaultFree spared;
    request->done.push_back("write " + std::string(data, length));
}

}  // extern "C"
