#include <cstdint>
#include <cstring>

#include "jsonz/jsonz.h"
#include "qierr/Writer.h"

// Operations on the whole JSON text of a status: replace it, find its end, enlarge its buffer.

namespace {

constexpr std::size_t tooLongText = 0x7FFFFFFE;
constexpr std::uint32_t mostWanted = 0x7FFFFFFD;
// The size of the smallest buffer that holds a text: two braces, the NUL and the end marker.
constexpr std::uint32_t emptyBuffer = 4;

bool makeRoom(qierr_Status* status, std::uint32_t size) {
    return size <= status->capacity || status->reallocJson(status, size) != 0;
}

}  // namespace

char* qierr_Status_setJson(qierr_Status* status, const char* text) {
    if (text == nullptr) {
        text = "{}";
    }
    const std::size_t length = strnlen(text, tooLongText);
    if (length == 0 || length == tooLongText) {
        return nullptr;
    }
    if (!makeRoom(status, static_cast<std::uint32_t>(length + 2))) {
        return nullptr;
    }
    if (status->json == nullptr || status->capacity <= length + 1) {
        return nullptr;
    }
    std::memmove(status->json, text, length);
    std::memset(status->json + length, 0, status->capacity - length - 1);
    status->json[status->capacity - 1] = 'J';
    return status->json + length - 1;
}

char* qierr_Status_jsonEnd(qierr_Status* status, std::uint32_t wanted) {
    if (wanted > mostWanted || !makeRoom(status, wanted + 2)) {
        return nullptr;
    }
    if (status->json == nullptr || (*status->json != '{' && *status->json != '[')) {
        return nullptr;
    }
    return const_cast<char*>(jsonz_endOfContainer(status->json));
}

char* qierr_Status_growJson(char* pos, qierr_Status* status) {
    const std::uint32_t capacity = status->capacity;
    if (capacity < emptyBuffer || capacity - 2 > mostWanted / 2) {
        return nullptr;
    }
    const std::ptrdiff_t offset = pos - status->json;
    // If reallocJson reports success without enlarging the buffer, retrying would never end.
    if (qierr_Status_jsonEnd(status, 2 * (capacity - 2)) == nullptr ||
        status->capacity <= capacity) {
        return nullptr;
    }
    return status->json + offset;
}

char* qierr_Status_addPosition(qierr_Status* status, char* pos,
                               const qierr_SourcePosition& position) {
    qierr_Writer writer{pos, qierr_Status_growJson, status};
    writer = qierr_Writer_addString(writer, "file", position.file);
    writer = qierr_Writer_addInt(writer, "line", position.line);
    if (position.component != nullptr) {
        writer = qierr_Writer_addString(writer, "component", position.component);
    }
    return writer.pos;
}

qierr_Writer qierr_Status_writerAtEnd(qierr_Status* status) {
    return {qierr_Status_jsonEnd(status, 2), qierr_Status_growJson, status};
}
