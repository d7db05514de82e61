#include "qierr/Exception.h"

namespace qierr {

ExceptionBase::ExceptionBase() noexcept : record{0, 0, qierr_Status_defaultRealloc, nullptr} {}

ExceptionBase::ExceptionBase(const ExceptionBase& source) noexcept : ExceptionBase() {
    qierr_Status_take(&record, &source.record);
}

ExceptionBase::~ExceptionBase() {
    if (record.json != nullptr) {
        record.reallocJson(&record, 0);
    }
}

const char* ExceptionBase::what() const noexcept {
    return record.json != nullptr ? record.json : "";
}

Exception::Exception(qierr_Status* source) noexcept {
    qierr_Status_take(status(), source);
}

Exception::Exception(const Exception& source) noexcept
    : ExceptionBase(source), std::exception(source) {}

Exception::~Exception() = default;

const char* Exception::what() const noexcept {
    return ExceptionBase::what();
}

}  // namespace qierr
