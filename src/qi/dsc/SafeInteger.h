#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>

#include "qi/dsc/exceptions.h"

// Arithmetic on sizes of 32 bits that throws exception::OutOfRange instead of wrapping around.
namespace qi::dsc {

constexpr std::uint32_t largestSize = std::numeric_limits<std::uint32_t>::max();

// The lines that the exceptions report. They are fixed, so that a report means the same whatever
// else changes in this file.
constexpr std::int32_t lineOfAddition = 125;
constexpr std::int32_t lineOfMultiplication = 163;

// `length` and one more, for a terminator.
inline std::uint32_t addOne(std::size_t length) {
    if (length >= largestSize) {
        throw exception::OutOfRange(lineOfAddition, __FILE__);
    }
    return static_cast<std::uint32_t>(length + 1);
}

// The bytes of `count` elements.
inline std::uint32_t multiply(std::uint32_t count, std::uint32_t elementSize) {
    const std::uint64_t product = std::uint64_t{count} * elementSize;
    if (product > largestSize) {
        throw exception::OutOfRange(lineOfMultiplication, __FILE__);
    }
    return static_cast<std::uint32_t>(product);
}

}  // namespace qi::dsc
