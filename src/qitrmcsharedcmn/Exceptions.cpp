#include "qitrmcsharedcmn/Exceptions.h"

#include <new>

namespace nQITRMCSHAREDCMN100 {

BasicError::BasicError(std::int32_t code, const qierr_SourcePosition& position) noexcept {
    qierr_Status_setCodeAt(status(), code, position);
}

BasicError::BasicError(const qierr_SourcePosition& position) noexcept
    : BasicError(qierr::codes::internalError, position) {}

BasicError::BasicError(const BasicError& source) noexcept
    : ExceptionBase(source), std::exception(source) {}

BasicError::~BasicError() = default;

const char* BasicError::what() const noexcept {
    return status()->json;
}

InternalError::InternalError(const char* comment, const qierr_SourcePosition& position) noexcept {
    qierr_Status_setCodeAt(status(), qierr::codes::internalError, position);
    addComment(qierr_orderedData(translatorName, status()), comment);
}

InternalError::InternalError(const InternalError& source) noexcept
    : ExceptionBase(source), std::exception(source) {}

InternalError::~InternalError() = default;

const char* InternalError::what() const noexcept {
    return status()->json;
}

void captureCurrentException(const std::exception& caught, qierr_Status* status) {
    if (const auto* const own = dynamic_cast<const qierr::ExceptionBase*>(&caught)) {
        qierr_Status_take(status, own->status());
    } else if (dynamic_cast<const std::bad_alloc*>(&caught) != nullptr) {
        qierr_Status_setCodeAt(status, qierr::codes::outOfMemory, capturePosition);
    } else if (qierr_Status_setCodeAt(status, qierr::codes::internalError, capturePosition) != 0) {
        qierr_Writer_addString(qierr_Status_writerAtEnd(status), "std_exception_what",
                               caught.what());
    }
}

ThrowingStatus::~ThrowingStatus() noexcept(false) {
    if (code < 0 && std::uncaught_exceptions() == 0) {
        throw qierr::Exception(this);
    }
}

}  // namespace nQITRMCSHAREDCMN100
