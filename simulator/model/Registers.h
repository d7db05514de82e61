#pragma once

#include <cstddef>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

namespace simulator {

struct Property;
struct Resource;

// A run of registers of one device. Wider registers are the bytes of the narrower ones, the lowest
// byte first.
struct RegisterBlock {
    // For people; may be empty.
    std::string name;
    std::string description;
    std::uint32_t address = 0;
    bool readable = true;
    bool writable = true;
    // The only width in bytes that is allowed, or 0 for any.
    std::uint32_t width = 0;
    // After power-on, and now. Of the same length, which is at least 1.
    std::vector<std::uint8_t> initial;
    std::vector<std::uint8_t> bytes;
    // Bytes become 0 when they have been read.
    bool clearsOnRead = false;
    // A bit written as 1 becomes 0, and one written as 0 stays.
    bool onesClear = false;
    // The command of the device that a write carries out. Empty for none.
    std::string command;
    // The stored property whose value the block shows instead of `bytes`, which then only give
    // the size, and the resource that has the property. Null for none.
    Resource* owner = nullptr;
    Property* property = nullptr;

    std::uint32_t size() const { return static_cast<std::uint32_t>(bytes.size()); }
    // Read or write `count` bytes (1, 2, 4 or 8) that lie in the block, with the side effects of
    // clearsOnRead and onesClear.
    std::uint64_t read(std::uint32_t from, std::uint32_t count);
    void write(std::uint32_t to, std::uint32_t count, std::uint64_t value);
};

// The registers of one device. An access must be aligned to its width and lie in one block.
class Registers {
  public:
    // Adds a block. Returns false when it would overlap another or pass the end of the addresses.
    bool add(RegisterBlock block);

    // The block in which an access of width bytes (1, 2, 4 or 8) lies. Refuses with
    // misalignedRegister and unmappedRegister.
    RegisterBlock& find(std::uint32_t address, std::uint32_t width);

    // Reads from a block. Threads may do so at the same time, while nothing writes.
    std::uint64_t read(RegisterBlock& block, std::uint32_t address, std::uint32_t width);

    void reset();

    // In the order of their addresses.
    const std::vector<RegisterBlock>& all() const { return blocks; }

  private:
    // The index of the first block after an address.
    std::size_t firstAfter(std::uint32_t address) const;

    std::vector<RegisterBlock> blocks;
    // Held while a block is read whose bytes become 0.
    std::mutex clearing;
};

}  // namespace simulator
