#include "qisysq/stdpath_util.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace {

// strerror_r has two signatures, depending on the C library; these overloads accept the result of
// either.
[[maybe_unused]] const char* textOf(int result, const char* buffer) {
    return result == 0 ? buffer : nullptr;
}
[[maybe_unused]] const char* textOf(const char* result, const char*) {
    return result;
}

}  // namespace

qierr_Writer qisysq_addErrno(qierr_Writer writer, std::int32_t error) {
    char buffer[256] = "";
    const char* text = textOf(strerror_r(error, buffer, sizeof buffer), buffer);
    writer = qierr_Writer_beginObject(writer, "internal_error");
    writer = qierr_Writer_addString(writer, "api", "errno");
    writer = qierr_Writer_addInt(writer, "code", error);
    if (text != nullptr && text[0] != '\0') {
        writer = qierr_Writer_addString(writer, "string", text);
    }
    return qierr_Writer_endObject(writer);
}

namespace qisysq {

namespace {

void reportNotOpened(const char* fileName, int error, qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_resourceNotFound,
                              QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    qierr_Writer writer = qisysq_addErrno(qierr_Status_writerAtEnd(status), error);
    writer = qierr_Writer_beginObject(writer, "qisysq_debug");
    writer = qierr_Writer_addString(writer, "desc", "error opening file");
    writer = qierr_Writer_addString(writer, "filename", fileName);
    qierr_Writer_endObject(writer);
}

void reportShortRead(const char* fileName, long size, std::size_t got, int error,
                     qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_osFault, QIERR_HERE_NAMED("qiapalerr_osFault"));
    qierr_Writer writer = qisysq_addErrno(qierr_Status_writerAtEnd(status), error);
    writer = qierr_Writer_beginObject(writer, "qisysq_debug");
    writer = qierr_Writer_addString(writer, "desc", "didn't read full content of file");
    writer = qierr_Writer_addInt(writer, "fileSize", static_cast<std::int32_t>(size));
    writer = qierr_Writer_addInt(writer, "fread_return", static_cast<std::int32_t>(got));
    writer = qierr_Writer_addString(writer, "filename", fileName);
    qierr_Writer_endObject(writer);
}

// The size of a file, or -1 for a file without one, such as a pipe or a directory.
long sizeOf(std::FILE* file) {
    if (std::fseek(file, 0, SEEK_END) != 0) {
        return -1;
    }
    const long size = std::ftell(file);
    std::rewind(file);
    return size > INT32_MAX - 1 ? -1 : size;
}

void readAll(std::FILE* file, const char* fileName, qihtl::String* buffer, qierr_Status* status) {
    errno = 0;
    const long size = sizeOf(file);
    buffer->clear();
    buffer->resize(size < 0 ? 0 : static_cast<std::uint32_t>(size), status);
    if (status->code < 0) {
        return;
    }
    const std::size_t got =
        size <= 0 ? 0 : std::fread(buffer->data(), 1, static_cast<std::size_t>(size), file);
    if (size < 0 || got < static_cast<std::size_t>(size)) {
        reportShortRead(fileName, size, got, errno, status);
    }
}

}  // namespace

void readFileToBuffer(const char* fileName, qihtl::String* buffer, qierr_Status* status) {
    if (status->code < 0) {
        return;
    }
    std::FILE* file = std::fopen(fileName, "rb");
    if (file == nullptr) {
        reportNotOpened(fileName, errno, status);
        return;
    }
    readAll(file, fileName, buffer, status);
    std::fclose(file);
}

}  // namespace qisysq
