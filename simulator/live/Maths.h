#pragma once

#include <cstdint>
#include <string_view>

// Functions that give the same bits on every platform, so that a run can be repeated anywhere. The
// mathematical functions of the C library differ in the last digit between processors.
namespace simulator {

// Spreads a number over all 64 bits. Different numbers give different results.
std::uint64_t mixed(std::uint64_t number);
// A number for a text, for use with mixed().
std::uint64_t keyOf(std::string_view text);

// Random numbers that belong to a key: evenly spread over 0 (inclusive) to 1 (exclusive)...
double uniform(std::uint64_t key);
// ...and normally distributed, with standard deviation 1 and within -6 and 6.
double gaussian(std::uint64_t key);

// exp(-x) for x from 0 to infinity.
double decay(double x);
// The sine of a fraction of a turn, 0 to 1.
double sineOfTurn(double turn);

// The number, limited to -1e300 to 1e300 so that sums and differences stay finite; 0 for NaN.
double finite(double number);
constexpr double largestFinite = 1e300;

}  // namespace simulator
