#include "qisysq/qidynlib.h"

#include <dlfcn.h>

#include "qierr/Writer.h"

namespace {

void reportFailure(qierr_Status* status, const qierr_SourcePosition& position, const char* what,
                   const char* subjectKey, const char* subject) {
    // dlerror() also clears the error, so it is called even if the text is not used.
    const char* reason = dlerror();
    if (!qierr_Status_setCodeNamed(status, qiapalerr_invalidParameter, position)) {
        return;
    }
    qierr_Writer writer = qierr_Status_writerAtEnd(status);
    writer = qierr_Writer_beginObject(writer, "qidynlib_debug");
    writer = qierr_Writer_addString(writer, "debug", what);
    writer = qierr_Writer_addString(writer, subjectKey, subject);
    writer = qierr_Writer_endObject(writer);
    writer = qierr_Writer_beginObject(writer, "internal_error");
    writer = qierr_Writer_addString(writer, "api", "dlerror");
    writer = qierr_Writer_addString(writer, "string", reason == nullptr ? "" : reason);
    qierr_Writer_endObject(writer);
}

}  // namespace

void* qidynlib_load(const char* path, qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    void* handle = dlopen(path, RTLD_NOW | RTLD_GLOBAL);
    if (handle == nullptr) {
        reportFailure(status, QIERR_HERE_NAMED("qiapalerr_invalidParameter"),
                      "failed to qidynlib_load library", "path", path);
    }
    return handle;
}

void* qidynlib_symbol(void* handle, const char* name, qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    void* address = dlsym(handle, name);
    if (address == nullptr) {
        reportFailure(status, QIERR_HERE_NAMED("qiapalerr_invalidParameter"),
                      "failed to get symbol", "qidynlib_symbol", name);
    }
    return address;
}
