#pragma once

#include <cstdint>
#include <vector>

#include "model/Values.h"

// How the values of properties are represented in registers: numbers as two's complement, or in the
// binary formats of IEEE 754, and Booleans as 0 or 1.
namespace simulator {

// The sizes in bytes that a scalar of this type may have there, in rising order; none for a text.
std::vector<std::uint32_t> registerSizes(DataType type);

// The bits of a scalar number or Boolean in so many bytes. What does not fit is cut off at the
// top; a real number that is too large becomes infinite.
std::uint64_t toRegister(const Elements& value, std::uint32_t size);
// The value of this type that `size` bytes represent. Each Boolean but 0 is true.
Elements fromRegister(DataType type, std::uint64_t bits, std::uint32_t size);

}  // namespace simulator
