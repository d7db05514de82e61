// Folder qitrmcsharedcmn: the service's exceptions and its lists of resource names.
#pragma once

#include <cstdint>
#include <exception>

#include "qierr/Exception.h"
#include "qierr/Writer.h"

namespace nQITRMCSHAREDCMN100 {

// The translator of every detail that the service adds to a status.
constexpr const char* translatorName = "mxlator_qitrmc";

// An error in a request. what() returns null if no detail was added.
class BasicError : virtual public qierr::ExceptionBase, virtual public std::exception {
  public:
    BasicError(std::int32_t code, const qierr_SourcePosition& position) noexcept;
    // The same with the code of an internal error.
    explicit BasicError(const qierr_SourcePosition& position) noexcept;
    BasicError(const BasicError& source) noexcept;
    ~BasicError() override;
    const char* what() const noexcept override;

    // A writer for details that are sent to the client.
    qierr_Writer details() noexcept { return qierr_orderedData(translatorName, status()); }
};

// An error in the program, which no request can cause. what() as in BasicError.
class InternalError : virtual public qierr::ExceptionBase, virtual public std::exception {
  public:
    // `comment` is for maintainers and is never sent to a client.
    InternalError(const char* comment, const qierr_SourcePosition& position) noexcept;
    InternalError(const InternalError& source) noexcept;
    ~InternalError() override;
    const char* what() const noexcept override;
};

// The source position that is reported for an exception without a status, whose own is unknown.
inline constexpr qierr_SourcePosition capturePosition = QITRMC_HERE;

// Converts the exception that a handler has caught into a status. A status that the exception
// contains is moved; std::bad_alloc becomes outOfMemory, any other exception internalError with its
// text. Looks at the type of the object, since throwing it again would take a twentieth of the time
// of a failing request.
void captureCurrentException(const std::exception& caught, qierr_Status* status);

// A status to pass to a driver call. The destructor throws qierr::Exception if the status is
// negative, except during stack unwinding. A warning is dropped.
class ThrowingStatus : public qierr::Status {
  public:
    ThrowingStatus() = default;
    ~ThrowingStatus() noexcept(false);
};

}  // namespace nQITRMCSHAREDCMN100
