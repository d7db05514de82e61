#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>

namespace qi::dsc {

// A string of 32-bit characters with an explicit end, in a block of its own. It may hold NULs.
//
// Construction throws std::bad_alloc without memory and exception::OutOfRange for a string whose
// block would need more than 32 bits of size.
class WideString {
  public:
    // Copies the characters from `begin` up to `end`; a null `begin` reads as empty.
    WideString(const std::uint32_t* begin, const std::uint32_t* end);
    // Widens a NUL-terminated ASCII text; null reads as empty.
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

// Compares character by character, each taken through towupper.
bool equalsIgnoringCase(const WideString& a, const WideString& b);

}  // namespace qi::dsc
