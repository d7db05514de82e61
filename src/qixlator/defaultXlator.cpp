#include "qixlator/defaultXlator.h"

#include <cstring>

#include "qisysq/stdpath.h"
#include "qixlator/qixlator.h"
#include "qixlator/qvErrorsParser.h"
#include "qixlator/reportFailure.h"

namespace {

void destroyDefault(XlatorInterface*) {}

// Searches in one language. Returns false, with the reason in `status`, on failure.
bool search(const char* errorsDirectory, std::int32_t code, std::int32_t language,
            qihtl::String* text, qierr_Status* status) {
    qixlator::findErrorDescriptionFromErrorsDir(errorsDirectory, code, language, text, status);
    return status->code >= 0;
}

// Searches in the requested language, then in English. `text` stays empty if nothing is found.
void searchWithFallback(const char* errorsDirectory, std::int32_t code, std::int32_t language,
                        qihtl::String* text, qierr_Status* status) {
    if (language != 0) {
        qierr::Status localStatus;
        if (search(errorsDirectory, code, language, text, &localStatus) && !text->empty()) {
            return;
        }
    }
    qierr::Status localStatus;
    if (!search(errorsDirectory, code, 0, text, &localStatus)) {
        qierr_Status_merge(status, &localStatus);
    }
}

void reportNotFound(std::int32_t code, std::uint32_t attributes, qierr_Status* status) {
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_resourceNotFound,
                                                  QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    writer = qierr_Writer_addString(writer, "qixlator_defaultTranslator",
                                    "couldn't find description for code");
    writer = qierr_Writer_addInt(writer, "code", code);
    writer = qierr_Writer_addInt(writer, "lang", 0);
    qierr_Writer_addInt(
        writer, "ade",
        static_cast<std::int32_t>((attributes >> qixlator_adeShift) & qixlator_adeMask));
}

char* getStaticDesc(XlatorInterface*, std::int32_t code, std::uint32_t attributes,
                    qixlator_Alloc alloc, void* allocContext, qierr_Status* status) {
    qihtl::String errorsDirectory;
    qisysq::getSharedDir(&errorsDirectory, status);
    errorsDirectory.append("/", status);
    errorsDirectory.append("errors", status);
    if (status->code < 0) {
        return nullptr;
    }
    qihtl::String text;
    searchWithFallback(errorsDirectory.c_str(), code,
                       static_cast<std::int32_t>(attributes & qixlator_languageMask), &text,
                       status);
    if (status->code < 0) {
        return nullptr;
    }
    if (text.empty()) {
        reportNotFound(code, attributes, status);
        return nullptr;
    }
    char* result = static_cast<char*>(alloc(nullptr, text.length() + 1, allocContext, status));
    if (result != nullptr) {
        std::memcpy(result, text.c_str(), text.length() + 1);
    }
    return result;
}

XlatorInterface defaultXlator = {16, destroyDefault, getStaticDesc, nullptr};

}  // namespace

XlatorInterface* qixlator_default_create(const char*, const char*, qierr_Status* status) {
    return status->code < 0 ? nullptr : &defaultXlator;
}
