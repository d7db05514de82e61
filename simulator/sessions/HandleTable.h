#pragma once

#include <cstdint>
#include <mutex>
#include <optional>
#include <unordered_map>
#include <utility>

namespace simulator {

// Items that callers identify by a number, which is unique and never 0. The number of a removed
// item is used again only after all other numbers have been used.
template <typename Item>
class HandleTable {
  public:
    explicit HandleTable(std::uint32_t first = 1) : next(first) {}

    // The number that the next item gets.
    std::uint32_t upcoming() {
        while (next == 0 || items.count(next) != 0) {
            ++next;
        }
        return next;
    }

    std::uint32_t add(Item item) {
        const std::uint32_t handle = upcoming();
        items.emplace(handle, std::move(item));
        ++next;
        return handle;
    }

    // Returns null when there is no such item. The item stays where it is until it is removed.
    Item* find(std::uint32_t handle) {
        const auto found = items.find(handle);
        return found == items.end() ? nullptr : &found->second;
    }

    // Returns whether there was such an item.
    bool remove(std::uint32_t handle) noexcept { return items.erase(handle) != 0; }

    // In no particular order.
    template <typename Visit>
    void forEach(Visit visit) {
        for (auto& [handle, item] : items) {
            visit(item);
        }
    }

    template <typename Visit>
    void forEach(Visit visit) const {
        for (const auto& [handle, item] : items) {
            visit(item);
        }
    }

    template <typename Condition>
    void removeIf(Condition condition) {
        for (auto place = items.begin(); place != items.end();) {
            place = condition(place->second) ? items.erase(place) : std::next(place);
        }
    }

    std::uint32_t size() const { return static_cast<std::uint32_t>(items.size()); }

  private:
    std::unordered_map<std::uint32_t, Item> items;
    std::uint32_t next;
};

// A handle table that is thread-safe, for small items.
template <typename Item>
class GuardedHandleTable {
  public:
    std::uint32_t add(const Item& item) {
        const std::lock_guard<std::mutex> lock(mutex);
        return table.add(item);
    }
    // A copy of the item, or nothing.
    std::optional<Item> find(std::uint32_t handle) {
        const std::lock_guard<std::mutex> lock(mutex);
        const Item* item = table.find(handle);
        return item != nullptr ? std::optional(*item) : std::nullopt;
    }
    bool remove(std::uint32_t handle) noexcept {
        const std::lock_guard<std::mutex> lock(mutex);
        return table.remove(handle);
    }
    template <typename Condition>
    void removeIf(Condition condition) {
        const std::lock_guard<std::mutex> lock(mutex);
        table.removeIf(condition);
    }
    std::uint32_t size() const {
        const std::lock_guard<std::mutex> lock(mutex);
        return table.size();
    }

  private:
    mutable std::mutex mutex;
    HandleTable<Item> table;
};

}  // namespace simulator
