#include "model/Registers.h"

#include <algorithm>

#include "status/Refusal.h"

namespace simulator {

namespace {

constexpr std::uint64_t addressCount = std::uint64_t{1} << 32;

std::uint64_t endOf(const RegisterBlock& block) {
    return std::uint64_t{block.address} + block.bytes.size();
}

}  // namespace

std::uint64_t RegisterBlock::read(std::uint32_t from, std::uint32_t count) {
    const std::size_t offset = from - address;
    std::uint64_t value = 0;
    for (std::uint32_t i = count; i > 0; --i) {
        std::uint8_t& byte = bytes[offset + i - 1];
        value = value << 8 | byte;
        if (clearsOnRead) {
            byte = 0;
        }
    }
    return value;
}

void RegisterBlock::write(std::uint32_t to, std::uint32_t count, std::uint64_t value) {
    const std::size_t offset = to - address;
    for (std::uint32_t i = 0; i < count; ++i) {
        std::uint8_t& byte = bytes[offset + i];
        const auto written = static_cast<std::uint8_t>(value >> (8 * i));
        byte = onesClear ? static_cast<std::uint8_t>(byte & ~written) : written;
    }
}

std::size_t Registers::firstAfter(std::uint32_t address) const {
    const auto after = std::upper_bound(
        blocks.begin(), blocks.end(), address,
        [](std::uint32_t left, const RegisterBlock& right) { return left < right.address; });
    return static_cast<std::size_t>(after - blocks.begin());
}

bool Registers::add(RegisterBlock block) {
    if (endOf(block) > addressCount) {
        return false;
    }
    const std::size_t next = firstAfter(block.address);
    if ((next > 0 && endOf(blocks[next - 1]) > block.address) ||
        (next < blocks.size() && endOf(block) > blocks[next].address)) {
        return false;
    }
    blocks.insert(blocks.begin() + static_cast<std::ptrdiff_t>(next), std::move(block));
    return true;
}

RegisterBlock& Registers::find(std::uint32_t address, std::uint32_t width) {
    if (address % width != 0) {
        throw Refusal(code::misalignedRegister)
            .usage(tag::registerAddress, address)
            .usage(tag::registerWidth, width * 8);
    }
    const std::size_t next = firstAfter(address);
    if (next > 0) {
        RegisterBlock& block = blocks[next - 1];
        const bool fits = block.width == 0 || block.width == width;
        if (fits && std::uint64_t{address} + width <= endOf(block)) {
            return block;
        }
    }
    throw Refusal(code::unmappedRegister)
        .usage(tag::registerAddress, address)
        .usage(tag::registerWidth, width * 8);
}

std::uint64_t Registers::read(RegisterBlock& block, std::uint32_t address, std::uint32_t width) {
    if (!block.clearsOnRead) {
        return block.read(address, width);
    }
    const std::lock_guard<std::mutex> lock(clearing);
    return block.read(address, width);
}

void Registers::reset() {
    for (RegisterBlock& block : blocks) {
        std::copy(block.initial.begin(), block.initial.end(), block.bytes.begin());
    }
}

}  // namespace simulator
