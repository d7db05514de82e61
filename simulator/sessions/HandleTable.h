#pragma once

#include <cstdint>
#include <map>
#include <utility>

namespace simulator {

// Items that callers identify by a number, which is unique and never 0. The number of a removed
// item is used again only after all other numbers have been used.
template <typename Item>
class HandleTable {
  public:
    explicit HandleTable(uint32_t first = 1) : next(first) {}

    // The number that the next item gets.
    uint32_t upcoming() {
        while (next == 0 || items.count(next) != 0) {
            ++next;
        }
        return next;
    }

    uint32_t add(Item item) {
        const uint32_t handle = upcoming();
        items.emplace(handle, std::move(item));
        ++next;
        return handle;
    }

    // Returns null when there is no such item. The item stays where it is until it is removed.
    Item* find(uint32_t handle) {
        const auto found = items.find(handle);
        return found == items.end() ? nullptr : &found->second;
    }

    // Returns whether there was such an item.
    bool remove(uint32_t handle) noexcept { return items.erase(handle) != 0; }

    template <typename Visit>
    void forEach(Visit visit) {
        for (auto& [handle, item] : items) {
            visit(item);
        }
    }

    template <typename Condition>
    void removeIf(Condition condition) {
        for (auto place = items.begin(); place != items.end();) {
            place = condition(place->second) ? items.erase(place) : std::next(place);
        }
    }

    uint32_t size() const { return static_cast<uint32_t>(items.size()); }

  private:
    std::map<uint32_t, Item> items;
    uint32_t next;
};

}  // namespace simulator
