#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace simulator {

// A run of registers of one device. Wider registers are the bytes of the narrower ones, the lowest
// byte first.
struct RegisterBlock {
    uint32_t address;
    bool writable;
    // After power-on, and now. Of the same length, which is at least 1.
    std::vector<uint8_t> initial;
    std::vector<uint8_t> bytes;
};

// The registers of one device. An access must be aligned to its width and lie in one block.
class Registers {
  public:
    // Adds a block. Returns false when it would overlap another or pass the end of the addresses.
    bool add(RegisterBlock block);

    // Move width bytes (1, 2, 4 or 8). Refuse with unmappedRegister, misalignedRegister and
    // readOnlyRegister.
    uint64_t read(uint32_t address, uint32_t width) const;
    void write(uint32_t address, uint32_t width, uint64_t value);

    void reset();

  private:
    size_t find(uint32_t address, uint32_t width) const;

    std::vector<RegisterBlock> blocks;
};

}  // namespace simulator
