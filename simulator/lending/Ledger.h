#pragma once

#include <array>
#include <cstddef>
#include <mutex>
#include <unordered_map>

namespace simulator {

// The memory that callers have been lent and have not returned. Thread-safe.
class Ledger {
  public:
    enum class Item { Text, Numbers, Texts };

    // There is one in the process.
    static Ledger& instance();

    // Adds an item. Throws std::bad_alloc, and has added nothing then.
    void lend(const void* address, Item item);
    // Removes what is returned. Returns whether it was lent as such an item.
    bool takeBack(const void* address, Item item) noexcept;

    bool has(const void* address) const noexcept;
    std::size_t count(Item item) const noexcept;

  private:
    // Several tables, so that threads seldom wait for each other.
    struct Part {
        mutable std::mutex mutex;
        std::unordered_map<const void*, Item> items;
    };

    static std::size_t partOf(const void* address) noexcept;

    std::array<Part, 16> parts;
};

}  // namespace simulator
