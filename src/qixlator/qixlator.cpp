#include "qixlator/qixlator.h"

#include <new>

#include "jsonz/jsonz.h"
#include "qihtl/Allocator.h"
#include "qixlator/Session.h"
#include "qixlator/jsonText.h"
#include "qixlator/reportFailure.h"

namespace {

void reportNoSession(qierr_Status* status) {
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_memoryFull,
                                                  QIERR_HERE_NAMED("qiapalerr_memoryFull"));
    qierr_Writer_addString(writer, "debug", "failed to allocate Session memory");
}

void reportUnsupported(const char* what, const char* xlatorName, qierr_Status* status) {
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_resourceNotFound,
                                                  QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    writer = qierr_Writer_addString(writer, "debug", what);
    qierr_Writer_addString(writer, "xlatorName", xlatorName);
}

void reportNoTranslator(const char* json, qierr_Status* status) {
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_resourceNotFound,
                                                  QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    writer = qierr_Writer_addString(writer, "debug", "could not find translator key in json");
    qierr_Writer_addString(writer, "json", json);
}

}  // namespace

qixlator::Session* qixlator_createSession(qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    void* memory = qihtl_realloc(nullptr, sizeof(qixlator::Session));
    if (memory == nullptr) {
        reportNoSession(status);
        return nullptr;
    }
    qierr::Status roomStatus;
    auto* session = new (memory) qixlator::Session(&roomStatus);
    if (roomStatus.code < 0) {
        qixlator_destroySession(session);
        reportNoSession(status);
        return nullptr;
    }
    return session;
}

void qixlator_destroySession(qixlator::Session* session) {
    if (session != nullptr) {
        session->~Session();
        qihtl_realloc(session, 0);
    }
}

char* qixlator_getStaticDesc(qixlator::Session* session, std::int32_t code, const char* xlatorName,
                             std::uint32_t attributes, qixlator_Alloc alloc, void* allocContext,
                             qierr_Status* status) {
    XlatorInterface* xlator = session->find(xlatorName, status);
    if (xlator == nullptr) {
        return nullptr;
    }
    if (xlator->getStaticDesc == nullptr) {
        reportUnsupported("xlator doesn't support getStaticDesc", xlatorName, status);
        return nullptr;
    }
    return xlator->getStaticDesc(xlator, code, attributes, alloc, allocContext, status);
}

char* qixlator_getDynamicDesc(qixlator::Session* session, const char* json,
                              std::uint32_t attributes, const char* format, qixlator_Alloc alloc,
                              void* allocContext, qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    qihtl::String xlatorName;
    qixlator::appendJsonString(jsonz_findMember(json, "translator"), &xlatorName, status);
    if (status->code >= 0 && xlatorName.empty()) {
        reportNoTranslator(json, status);
    }
    XlatorInterface* xlator = session->find(xlatorName.c_str(), status);
    if (xlator == nullptr) {
        return nullptr;
    }
    if (xlator->getDynamicDesc == nullptr) {
        reportUnsupported("xlator doesn't support getDynamicDesc", xlatorName.c_str(), status);
        return nullptr;
    }
    return xlator->getDynamicDesc(xlator, json, attributes, format, alloc, allocContext, status);
}

void* qixlator_realloc(void* pointer, std::uint32_t size, void*, qierr_Status* status) {
    if (size != 0 && status != nullptr && status->code < 0) {
        return nullptr;
    }
    void* moved = qihtl_realloc(pointer, size);
    if (moved == nullptr && size != 0 && status != nullptr) {
        qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_memoryFull,
                                                      QIERR_HERE_NAMED("qiapalerr_memoryFull"));
        qierr_Writer_addString(writer, "debug", "realloc failed");
    }
    return moved;
}
