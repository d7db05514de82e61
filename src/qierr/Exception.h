#pragma once

#include <exception>

#include "qierr/Status.h"

namespace qierr {

// What the three exception classes share: one status record, which the exception owns.
//
// Copying moves the JSON text out of the source, so that a thrown copy of a local object takes its
// details along.
class ExceptionBase {
  public:
    virtual ~ExceptionBase();
    // The JSON text, or "" when there is none.
    virtual const char* what() const noexcept;

    // The status, for adding details before the throw and for taking it in a handler.
    qierr_Status* status() const noexcept { return &record; }

  protected:
    ExceptionBase() noexcept;
    ExceptionBase(const ExceptionBase& source) noexcept;
    ExceptionBase& operator=(const ExceptionBase&) = delete;

  private:
    mutable qierr_Status record;
};

// A failure passed on from a status.
class Exception : virtual public ExceptionBase, virtual public std::exception {
  public:
    // Takes the code and the text out of `source`.
    explicit Exception(qierr_Status* source) noexcept;
    Exception(const Exception& source) noexcept;
    ~Exception() override;
    const char* what() const noexcept override;
};

}  // namespace qierr
