#pragma once

#include <array>
#include <cstddef>
#include <mutex>
#include <unordered_map>

namespace simulator {

// The memory that callers have been lent and have not returned. Memory that is kept as well may be
// lent to several callers at the same time. Thread-safe.
class Ledger {
  public:
    enum class Item { Text, Numbers, Texts };
    enum class Return { NotLent, StillUsed, Unused };

    // There is one in the process.
    static Ledger& instance();

    // Lends memory. Throws std::bad_alloc, and has lent nothing then; memory that is kept is lent
    // without a failure.
    void lend(const void* address, Item item);
    // Takes back what was lent as such an item. The caller frees it when it is unused.
    Return takeBack(const void* address, Item item) noexcept;

    // Keeps memory that is lent.
    void keep(const void* address) noexcept;
    // Ends that. Returns whether the memory is unused; the caller frees it then.
    bool release(const void* address) noexcept;

    bool has(const void* address) const noexcept;
    // How often items of a kind are lent.
    std::size_t count(Item item) const noexcept;

  private:
    struct Use {
        Item item;
        bool isKept = false;
        std::size_t loans = 0;
    };

    // Several tables, so that threads seldom wait for each other.
    struct alignas(64) Part {
        // Removes memory without a use. Returns whether there was none.
        bool removeUnused(std::unordered_map<const void*, Use>::iterator place) noexcept;

        mutable std::mutex mutex;
        std::unordered_map<const void*, Use> uses;
    };

    static std::size_t partOf(const void* address) noexcept;

    std::array<Part, 16> parts;
};

}  // namespace simulator
