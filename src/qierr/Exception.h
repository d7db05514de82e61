#pragma once

#include <exception>

#include "qierr/Status.h"

namespace qierr {

// Base of the three exception classes: owns one status record.
//
// Copying moves the JSON text out of the source, so that throwing a local object keeps its details
// without allocating memory.
class ExceptionBase {
  public:
    virtual ~ExceptionBase();
    // The JSON text, or "" if there is none.
    virtual const char* what() const noexcept;

    // The status, for adding details before the throw and for reading it in a catch block.
    qierr_Status* status() const noexcept { return &record; }

  protected:
    ExceptionBase() noexcept;
    ExceptionBase(const ExceptionBase& source) noexcept;
    ExceptionBase& operator=(const ExceptionBase&) = delete;

  private:
    mutable qierr_Status record;
};

// A failure that was reported in a status.
class Exception : virtual public ExceptionBase, virtual public std::exception {
  public:
    // Copies the code of `source` and takes its text.
    explicit Exception(qierr_Status* source) noexcept;
    Exception(const Exception& source) noexcept;
    ~Exception() override;
    const char* what() const noexcept override;
};

}  // namespace qierr
