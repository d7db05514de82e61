#include "model/Registers.h"

#include "status/Refusal.h"

namespace simulator {

namespace {

constexpr uint64_t addressCount = uint64_t{1} << 32;

uint64_t endOf(const RegisterBlock& block) {
    return uint64_t{block.address} + block.bytes.size();
}

}  // namespace

bool Registers::add(RegisterBlock block) {
    if (endOf(block) > addressCount) {
        return false;
    }
    for (const RegisterBlock& other : blocks) {
        if (block.address < endOf(other) && other.address < endOf(block)) {
            return false;
        }
    }
    blocks.push_back(std::move(block));
    return true;
}

size_t Registers::find(uint32_t address, uint32_t width) const {
    if (address % width != 0) {
        throw Refusal(code::misalignedRegister)
            .usage(tag::registerAddress, address)
            .usage(tag::registerWidth, width * 8);
    }
    for (size_t i = 0; i < blocks.size(); ++i) {
        if (address >= blocks[i].address && uint64_t{address} + width <= endOf(blocks[i])) {
            return i;
        }
    }
    throw Refusal(code::unmappedRegister)
        .usage(tag::registerAddress, address)
        .usage(tag::registerWidth, width * 8);
}

uint64_t Registers::read(uint32_t address, uint32_t width) const {
    const RegisterBlock& block = blocks[find(address, width)];
    const size_t offset = address - block.address;
    uint64_t value = 0;
    for (uint32_t i = width; i > 0; --i) {
        value = value << 8 | block.bytes[offset + i - 1];
    }
    return value;
}

void Registers::write(uint32_t address, uint32_t width, uint64_t value) {
    RegisterBlock& block = blocks[find(address, width)];
    if (!block.writable) {
        throw Refusal(code::readOnlyRegister).usage(tag::registerAddress, address);
    }
    const size_t offset = address - block.address;
    for (uint32_t i = 0; i < width; ++i) {
        block.bytes[offset + i] = static_cast<uint8_t>(value >> (8 * i));
    }
}

void Registers::reset() {
    for (RegisterBlock& block : blocks) {
        block.bytes = block.initial;
    }
}

}  // namespace simulator
