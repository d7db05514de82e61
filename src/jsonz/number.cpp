#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>

#include "jsonz/jsonz.h"

namespace {

constexpr long lowest = std::numeric_limits<std::int32_t>::min();
constexpr long highest = std::numeric_limits<std::int32_t>::max();

// The conversion functions below stop at the end of the number, so the text need not be copied.

std::int32_t wholeNumber(const char* text, std::int32_t fallback) {
    char* end = nullptr;
    const long number = std::strtol(text, &end, 0);
    return end == text ? fallback : static_cast<std::int32_t>(std::clamp(number, lowest, highest));
}

bool decimalSeparatorIsComma() {
    char sample[16];
    std::snprintf(sample, sizeof sample, "%.1f", 1.5);
    return sample[1] == ',';
}

std::int32_t realNumber(const char* text, std::size_t length, std::int32_t fallback) {
    char localised[64];
    if (decimalSeparatorIsComma()) {
        length = std::min(length, sizeof localised - 1);
        std::memcpy(localised, text, length);
        localised[length] = '\0';
        if (char* dot = std::strchr(localised, '.')) {
            *dot = ',';
        }
        text = localised;
    }
    char* end = nullptr;
    const double number = std::strtod(text, &end);
    if (end == text) {
        return fallback;
    }
    return static_cast<std::int32_t>(
        std::clamp(number, static_cast<double>(lowest), static_cast<double>(highest)));
}

}  // namespace

std::int32_t jsonz_getInt(const char* position, std::int32_t fallback, const char** end) {
    jsonz_value value;
    const char* behind = jsonz_readValue(position, &value);
    if (end != nullptr) {
        *end = behind;
    }
    if (value.type != jsonz_typeNumber) {
        return fallback;
    }
    return value.isReal ? realNumber(value.text, value.length, fallback)
                        : wholeNumber(value.text, fallback);
}
