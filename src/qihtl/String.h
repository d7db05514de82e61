#pragma once

#include <cstdint>

#include "qihtl/Allocator.h"

namespace qihtl {

// A string that reports a failed allocation in a status (qiapalerr_memoryFull) instead of throwing.
//
// An operation that takes a status does nothing if the status is already negative, and leaves the
// text unchanged if it fails. The text is followed by a NUL that its length does not include, and
// may contain NUL bytes. Arguments must not point into the string itself. A string can be moved but
// not copied, and may be used by one thread at a time.
class String {
  public:
    String() noexcept = default;
    ~String();
    String(String&& source) noexcept;
    String(const String&) = delete;
    String& operator=(const String&) = delete;

    // Never null.
    const char* c_str() const noexcept { return pointer == nullptr ? "" : pointer; }
    // The text for changes in place; null until something has been stored.
    char* data() noexcept { return pointer; }
    std::uint32_t length() const noexcept { return used; }
    // The length of the longest text that fits without a new allocation.
    std::uint32_t capacity() const noexcept { return room; }
    bool empty() const noexcept { return used == 0; }
    bool equals(const char* text) const noexcept;

    void clear() noexcept;
    // Reduces the capacity to the length, unless that allocation fails.
    void shrink() noexcept;
    // Allocates room for exactly `wanted` bytes of text unless the capacity suffices.
    void reserve(std::uint32_t wanted, qierr_Status* status);
    // Changes the length to `wanted` bytes; added bytes are NUL.
    void resize(std::uint32_t wanted, qierr_Status* status);

    void assign(const char* text, qierr_Status* status);
    void assign(const char* text, std::uint32_t textLength, qierr_Status* status);
    // A null text counts as empty.
    void append(const char* text, qierr_Status* status);
    void append(const char* text, std::uint32_t textLength, qierr_Status* status);
    // Replaces `count` bytes at `position`; the range must lie within the text.
    void replace(std::uint32_t position, std::uint32_t count, const char* text,
                 std::uint32_t textLength, qierr_Status* status);

    // Remove all leading or trailing bytes that occur in `characters`.
    void trimStart(const char* characters) noexcept;
    void trimEnd(const char* characters) noexcept;

  private:
    // Allocates room for at least `needed` bytes of text, growing by half.
    bool grow(std::uint64_t needed, qierr_Status* status);
    bool setRoom(std::uint32_t wanted, qierr_Status* status);

    char* pointer = nullptr;
    std::uint32_t room = 0;
    std::uint32_t used = 0;
};

}  // namespace qihtl
