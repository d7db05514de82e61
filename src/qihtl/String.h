#pragma once

#include <cstdint>

#include "qihtl/Allocator.h"

namespace qihtl {

// A text that reports a failed allocation in a status (qiapalerr_memoryFull) where a standard one
// would throw.
//
// Every operation that takes a status does nothing when that is already negative, and leaves the
// text as it was when it fails. The text is followed by a NUL that does not count; it may hold NUL
// bytes itself. Texts that are passed in must not lie inside the string. Moved, not copied; used by
// one thread at a time.
class String {
  public:
    String() noexcept = default;
    ~String();
    String(String&& source) noexcept;
    String(const String&) = delete;
    String& operator=(const String&) = delete;

    // Never null.
    const char* c_str() const noexcept { return pointer == nullptr ? "" : pointer; }
    // The text for changing in place, null as long as nothing was ever stored.
    char* data() noexcept { return pointer; }
    std::uint32_t length() const noexcept { return used; }
    // Bytes of text that fit without growing.
    std::uint32_t capacity() const noexcept { return room; }
    bool empty() const noexcept { return used == 0; }
    bool equals(const char* text) const noexcept;

    void clear() noexcept;
    // Gives back the memory beyond the text, if it can.
    void shrink() noexcept;
    // Makes room for exactly `wanted` bytes of text unless there is room already.
    void reserve(std::uint32_t wanted, qierr_Status* status);
    // Makes the text `wanted` bytes long; bytes beyond the old text are NUL.
    void resize(std::uint32_t wanted, qierr_Status* status);

    void assign(const char* text, qierr_Status* status);
    void assign(const char* text, std::uint32_t textLength, qierr_Status* status);
    // A null text counts as empty.
    void append(const char* text, qierr_Status* status);
    void append(const char* text, std::uint32_t textLength, qierr_Status* status);
    // Replaces `count` bytes at `position`, both within the text.
    void replace(std::uint32_t position, std::uint32_t count, const char* text,
                 std::uint32_t textLength, qierr_Status* status);

    // Removes every leading or trailing byte that occurs in `characters`.
    void trimStart(const char* characters) noexcept;
    void trimEnd(const char* characters) noexcept;

  private:
    // Room for `needed` bytes of text, growing by half.
    bool grow(std::uint64_t needed, qierr_Status* status);
    bool setRoom(std::uint32_t wanted, qierr_Status* status);

    char* pointer = nullptr;
    std::uint32_t room = 0;
    std::uint32_t used = 0;
};

}  // namespace qihtl
