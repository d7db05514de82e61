#pragma once

#include <cstddef>
#include <functional>
#include <string_view>
#include <unordered_map>

namespace simulator {

// A name with its hash, which is computed once for look-ups in several indexes. The text must exist
// as long as this object.
struct HashedName {
    explicit HashedName(std::string_view text)
        : text(text), hash(std::hash<std::string_view>()(text)) {}
    bool operator==(const HashedName& other) const {
        return hash == other.hash && text == other.text;
    }

    std::string_view text;
    std::size_t hash;
};

struct HashOfName {
    std::size_t operator()(const HashedName& name) const noexcept { return name.hash; }
};

// Items by name, in no particular order. The names belong to the items.
template <typename Item>
using NameIndex = std::unordered_map<HashedName, Item, HashOfName>;

// The item, or null when there is no such name.
template <typename Item>
Item* findIn(const NameIndex<Item*>& index, const HashedName& name) {
    const auto found = index.find(name);
    return found == index.end() ? nullptr : found->second;
}

}  // namespace simulator
