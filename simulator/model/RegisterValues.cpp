#include "model/RegisterValues.h"

#include <cmath>
#include <cstring>
#include <limits>
#include <type_traits>

namespace simulator {

namespace {

static_assert(std::numeric_limits<double>::is_iec559 && std::numeric_limits<float>::is_iec559);

float narrowed(double number) {
    constexpr double most = std::numeric_limits<float>::max();
    if (std::fabs(number) > most) {
        return std::copysign(std::numeric_limits<float>::infinity(),
                             static_cast<float>(number > 0 ? 1 : -1));
    }
    return static_cast<float>(number);
}

template <typename Bits, typename Number>
Bits bitsOf(Number number) {
    static_assert(sizeof(Bits) == sizeof(Number));
    Bits bits;
    std::memcpy(&bits, &number, sizeof bits);
    return bits;
}

template <typename Number, typename Bits>
Number numberOf(Bits bits) {
    static_assert(sizeof(Bits) == sizeof(Number));
    Number number;
    std::memcpy(&number, &bits, sizeof number);
    return number;
}

std::uint64_t bitsOfElement(double number, std::uint32_t size) {
    return size == sizeof(float) ? bitsOf<std::uint32_t>(narrowed(number))
                                 : bitsOf<std::uint64_t>(number);
}

template <typename Integer>
std::uint64_t bitsOfElement(Integer number, std::uint32_t) {
    return static_cast<std::uint64_t>(number);
}

std::uint64_t bitsOfElement(const std::string&, std::uint32_t) {
    return 0;
}

std::uint64_t extended(std::uint64_t bits, std::uint32_t size) {
    const std::uint64_t sign = std::uint64_t{1} << (8 * size - 1);
    return (bits ^ sign) - sign;
}

}  // namespace

std::vector<std::uint32_t> registerSizes(DataType type) {
    switch (type) {
        case DataType::Boolean:
        case DataType::Int64:
        case DataType::Uint64:
            return {1, 2, 4, 8};
        case DataType::Int32:
        case DataType::Uint32:
            return {1, 2, 4};
        case DataType::Real:
            return {4, 8};
        default:
            return {};
    }
}

std::uint64_t toRegister(const Elements& value, std::uint32_t size) {
    return std::visit([&](const auto& list) { return bitsOfElement(list.front(), size); }, value);
}

Elements fromRegister(DataType type, std::uint64_t bits, std::uint32_t size) {
    switch (type) {
        case DataType::Boolean:
            return List<std::uint8_t>{bits != 0 ? std::uint8_t{1} : std::uint8_t{0}};
        case DataType::Int32:
            return List<std::int32_t>{static_cast<std::int32_t>(extended(bits, size))};
        case DataType::Int64:
            return List<std::int64_t>{static_cast<std::int64_t>(extended(bits, size))};
        case DataType::Uint32:
            return List<std::uint32_t>{static_cast<std::uint32_t>(bits)};
        case DataType::Uint64:
            return List<std::uint64_t>{bits};
        default:
            return List<double>{size == sizeof(float)
                                    ? numberOf<float>(static_cast<std::uint32_t>(bits))
                                    : numberOf<double>(bits)};
    }
}

}  // namespace simulator
