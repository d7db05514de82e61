#include "live/Maths.h"

#include <algorithm>
#include <cmath>

namespace simulator {

std::uint64_t mixed(std::uint64_t number) {
    // The digits of the golden ratio and of the roots of 2 and 3, made odd.
    number += 0x9E3779B97F4A7C15;
    number = (number ^ number >> 31) * 0x6A09E667F3BCC909;
    number = (number ^ number >> 29) * 0xBB67AE8584CAA73B;
    number = (number ^ number >> 32) * 0x6A09E667F3BCC909;
    return number ^ number >> 30;
}

std::uint64_t keyOf(std::string_view text) {
    std::uint64_t key = text.size();
    for (const char c : text) {
        key = mixed(key ^ static_cast<unsigned char>(c));
    }
    return key;
}

double uniform(std::uint64_t key) {
    return static_cast<double>(mixed(key) >> 11) * 0x1p-53;
}

double gaussian(std::uint64_t key) {
    // Twelve numbers of 16 bits, whose sum has a variance of 2^32 and nearly the normal shape.
    constexpr std::uint64_t mean = 12 * 65535 / 2;
    std::uint64_t sum = 0;
    for (std::uint64_t i = 0; i < 3; ++i) {
        const std::uint64_t bits = mixed(key + i);
        sum += (bits & 0xFFFF) + (bits >> 16 & 0xFFFF) + (bits >> 32 & 0xFFFF) + (bits >> 48);
    }
    return (static_cast<double>(sum) - static_cast<double>(mean)) * 0x1p-16;
}

double decay(double x) {
    constexpr double gone = 700.0;
    constexpr double halfLife = 0x1.62e42fefa39efp-1;
    constexpr int terms = 14;
    if (!(x < gone)) {
        return 0.0;
    }
    const double halvings = std::floor(x / halfLife + 0.5);
    const double rest = x - halvings * halfLife;
    double sum = 1.0;
    for (int i = terms; i > 0; --i) {
        sum = 1.0 - rest / i * sum;
    }
    return std::ldexp(sum, -static_cast<int>(halvings));
}

double sineOfTurn(double turn) {
    constexpr double fullTurn = 0x1.921fb54442d18p+2;
    constexpr int terms = 11;
    const double half = turn > 0.5 ? turn - 0.5 : turn;
    const double x = std::min(half, 0.5 - half) * fullTurn;
    double sum = 1.0;
    for (int i = terms; i > 0; --i) {
        sum = 1.0 - x * x / (2 * i * (2 * i + 1)) * sum;
    }
    return turn > 0.5 ? -x * sum : x * sum;
}

double finite(double number) {
    return std::isnan(number) ? 0.0 : std::clamp(number, -largestFinite, largestFinite);
}

}  // namespace simulator
