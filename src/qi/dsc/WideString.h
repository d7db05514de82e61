// Folder qi/dsc: strings of 32-bit characters, and size arithmetic that detects overflow.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>

namespace qi::dsc {

// An owned string of 32-bit characters with an explicit end, which may contain NULs.
//
// Construction throws std::bad_alloc if memory runs out and exception::OutOfRange if the size in
// bytes does not fit into 32 bits.
class WideString {
  public:
    // Copies the characters from `begin` up to `end`; a null `begin` gives an empty string.
    WideString(const std::uint32_t* begin, const std::uint32_t* end);
    // Widens a NUL-terminated ASCII text; null gives an empty string.
    explicit WideString(const char* text);

    const std::uint32_t* begin() const noexcept { return block.get(); }
    const std::uint32_t* end() const noexcept { return block.get() + length; }

  private:
    struct Free {
        void operator()(std::uint32_t* memory) const noexcept { std::free(memory); }
    };

    // A terminated block for `length` characters.
    explicit WideString(std::size_t length);

    std::unique_ptr<std::uint32_t[], Free> block;
    std::size_t length;
};

// Compares character by character after towupper.
bool equalsIgnoringCase(const WideString& a, const WideString& b);

}  // namespace qi::dsc
