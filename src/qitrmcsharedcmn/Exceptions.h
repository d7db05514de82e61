#pragma once

#include <cstdint>
#include <exception>

#include "qierr/Exception.h"
#include "qierr/Writer.h"

namespace nQITRMCSHAREDCMN100 {

// The translator of every detail that the service adds to a status.
constexpr const char* translatorName = "mxlator_qitrmc";

// A fault of a request. `what` is null when no detail was added.
class BasicError : virtual public qierr::ExceptionBase, virtual public std::exception {
  public:
    BasicError(std::int32_t code, const qierr_SourcePosition& position) noexcept;
    // The same with the code of an internal error.
    explicit BasicError(const qierr_SourcePosition& position) noexcept;
    BasicError(const BasicError& source) noexcept;
    ~BasicError() override;
    const char* what() const noexcept override;

    // Where details for the client are added.
    qierr_Writer details() noexcept { return qierr_orderedData(translatorName, status()); }
};

// A fault of the program, which no request can cause. `what` as BasicError's.
class InternalError : virtual public qierr::ExceptionBase, virtual public std::exception {
  public:
    // `comment` is for maintainers and never reaches a client.
    InternalError(const char* comment, const qierr_SourcePosition& position) noexcept;
    InternalError(const InternalError& source) noexcept;
    ~InternalError() override;
    const char* what() const noexcept override;
};

// What a captured exception without a status is reported at. Its own place is unknown.
inline constexpr qierr_SourcePosition capturePosition = QITRMC_HERE;

// Turns the exception in flight into a status, from inside a handler: a status that it carries is
// taken over; an allocation failure becomes outOfMemory and any other std::exception internalError
// with its text. Any other kind of exception passes through.
void captureCurrentException(qierr_Status* status);

// A status around driver calls: filled by the call, it throws qierr::Exception from its destructor
// when it ends negative and no exception is in flight. A warning is dropped.
class ThrowingStatus : public qierr::Status {
  public:
    ThrowingStatus() = default;
    ~ThrowingStatus() noexcept(false);
};

}  // namespace nQITRMCSHAREDCMN100
