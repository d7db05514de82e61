#pragma once

#include <cstdint>
#include <exception>

// Exceptions thrown by the size arithmetic and by the types that use it.
namespace qi::dsc::exception {

class Exception : public std::exception {
  public:
    // `file` is not copied and must outlive the exception.
    Exception(std::int32_t line, const char* file) noexcept : line(line), file(file) {}
    const char* what() const noexcept override { return "unspecified exception"; }
    // Identifies the kind of failure.
    virtual std::uint32_t code() const noexcept { return 0xFFFFFFFF; }

    // Where the exception was thrown.
    const std::int32_t line;
    const char* const file;
};

class OutOfRange : public Exception {
  public:
    using Exception::Exception;
    const char* what() const noexcept override { return "Out of range"; }
    std::uint32_t code() const noexcept override { return 0x8ABC7007; }
};

class BoundExceeded : public Exception {
  public:
    using Exception::Exception;
    const char* what() const noexcept override {
        return "A request was made that would exceed the bounds";
    }
};

class BufferOverflow : public Exception {
  public:
    using Exception::Exception;
    const char* what() const noexcept override { return "Buffer overflowed"; }
};

class DeserializationError : public Exception {
  public:
    using Exception::Exception;
    const char* what() const noexcept override { return "Failed to deserialize"; }
};

class InvalidArgument : public Exception {
  public:
    using Exception::Exception;
};

class InvalidSequence : public Exception {
  public:
    using Exception::Exception;
};

class InvalidLocale : public Exception {
  public:
    using Exception::Exception;
};

class OutOfRange2 : public OutOfRange {
  public:
    using OutOfRange::OutOfRange;
};

class BoundExceeded2 : public BoundExceeded {
  public:
    using BoundExceeded::BoundExceeded;
};

class InvalidArgument2 : public InvalidArgument {
  public:
    using InvalidArgument::InvalidArgument;
};

}  // namespace qi::dsc::exception
