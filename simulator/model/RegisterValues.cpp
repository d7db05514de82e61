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

uint64_t bitsOfElement(double number, uint32_t size) {
    return size == sizeof(float) ? bitsOf<uint32_t>(narrowed(number)) : bitsOf<uint64_t>(number);
}

template <typename Integer>
uint64_t bitsOfElement(Integer number, uint32_t) {
    return static_cast<uint64_t>(number);
}

uint64_t bitsOfElement(const std::string&, uint32_t) {
    return 0;
}

uint64_t extended(uint64_t bits, uint32_t size) {
    const uint64_t sign = uint64_t{1} << (8 * size - 1);
    return (bits ^ sign) - sign;
}

}  // namespace

std::vector<uint32_t> registerSizes(DataType type) {
    switch (type) {
        case DataType::boolean:
        case DataType::int64:
        case DataType::uint64:
            return {1, 2, 4, 8};
        case DataType::int32:
        case DataType::uint32:
            return {1, 2, 4};
        case DataType::real:
            return {4, 8};
        default:
            return {};
    }
}

uint64_t toRegister(const Elements& value, uint32_t size) {
    return std::visit([&](const auto& list) { return bitsOfElement(list.front(), size); }, value);
}

Elements fromRegister(DataType type, uint64_t bits, uint32_t size) {
    switch (type) {
        case DataType::boolean:
            return List<uint8_t>{bits != 0 ? uint8_t{1} : uint8_t{0}};
        case DataType::int32:
            return List<int32_t>{static_cast<int32_t>(extended(bits, size))};
        case DataType::int64:
            return List<int64_t>{static_cast<int64_t>(extended(bits, size))};
        case DataType::uint32:
            return List<uint32_t>{static_cast<uint32_t>(bits)};
        case DataType::uint64:
            return List<uint64_t>{bits};
        default:
            return List<double>{size == sizeof(float) ? numberOf<float>(static_cast<uint32_t>(bits))
                                                      : numberOf<double>(bits)};
    }
}

}  // namespace simulator
