#pragma once

#include <cstddef>
#include <mutex>
#include <unordered_map>

namespace simulator {

// Everything that callers have been lent and have not given back. Any thread may use it at any
// time.
class Ledger {
  public:
    enum class Item { text, numbers, texts };

    // The one of the process.
    static Ledger& instance();

    // Notes what is lent now. Throws std::bad_alloc, and has noted nothing then.
    void lend(const void* address, Item item);
    // Strikes out what comes back. Returns whether it was lent as such an item.
    bool takeBack(const void* address, Item item) noexcept;

    bool has(const void* address) const noexcept;
    size_t count(Item item) const noexcept;

  private:
    mutable std::mutex mutex;
    std::unordered_map<const void*, Item> items;
};

}  // namespace simulator
