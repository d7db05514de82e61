#include "qi/dsc/WideString.h"

#include <algorithm>
#include <cstring>
#include <cwctype>
#include <new>

#include "qi/dsc/SafeInteger.h"

namespace qi::dsc {

namespace {

std::uint32_t* allocate(std::size_t length) {
    const std::uint32_t size = multiply(addOne(length), sizeof(std::uint32_t));
    void* memory = std::malloc(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return static_cast<std::uint32_t*>(memory);
}

}  // namespace

WideString::WideString(std::size_t length) : block(allocate(length)), length(length) {
    block[length] = 0;
}

WideString::WideString(const std::uint32_t* begin, const std::uint32_t* end)
    : WideString(begin != nullptr ? static_cast<std::size_t>(end - begin) : 0) {
    std::copy_n(begin, length, block.get());
}

WideString::WideString(const char* text)
    : WideString(text != nullptr ? std::strlen(text) : std::size_t{0}) {
    std::transform(text, text + length, block.get(),
                   [](char c) { return static_cast<unsigned char>(c); });
}

bool equalsIgnoringCase(const WideString& a, const WideString& b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](std::uint32_t x, std::uint32_t y) {
        return std::towupper(static_cast<std::wint_t>(x)) ==
               std::towupper(static_cast<std::wint_t>(y));
    });
}

}  // namespace qi::dsc
