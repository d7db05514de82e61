#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>

#include "qi/dsc/exceptions.h"

// Arithmetic on 32-bit sizes that throws exception::OutOfRange instead of wrapping around.
namespace qi::dsc {

constexpr std::uint32_t largestSize = std::numeric_limits<std::uint32_t>::max();

// The line numbers that the exceptions report. They are fixed, so that changes to this file do not
// alter the reports.
constexpr std::int32_t lineOfAddition = 125;
constexpr std::int32_t lineOfMultiplication = 163;

// `length` plus one, for a terminator.
inline std::uint32_t addOne(std::size_t length) {
    if (length >= largestSize) {
        throw exception::OutOfRange(lineOfAddition, __FILE__);
    }
    return static_cast<std::uint32_t>(length + 1);
}

// The size of `count` elements in bytes.
inline std::uint32_t multiply(std::uint32_t count, std::uint32_t elementSize) {
    const std::uint64_t product = std::uint64_t{count} * elementSize;
    if (product > largestSize) {
        throw exception::OutOfRange(lineOfMultiplication, __FILE__);
    }
    return static_cast<std::uint32_t>(product);
}

}  // namespace qi::dsc
