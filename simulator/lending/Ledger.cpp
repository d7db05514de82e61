#include "lending/Ledger.h"

#include <algorithm>
#include <cstdint>
#include <new>

namespace simulator {

Ledger& Ledger::instance() {
    // Never destroyed, as items may be returned until the very end of the process; and created
    // without allocation, as returning cannot fail.
    alignas(Ledger) static unsigned char place[sizeof(Ledger)];
    static Ledger& ledger = *new (place) Ledger;
    return ledger;
}

std::size_t Ledger::partOf(const void* address) noexcept {
    // The lowest bits are those of the alignment.
    const auto number = reinterpret_cast<std::uintptr_t>(address) >> 4;
    return (number ^ number >> 4 ^ number >> 8) % std::tuple_size<decltype(parts)>::value;
}

void Ledger::lend(const void* address, Item item) {
    Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    part.items.emplace(address, item);
}

bool Ledger::takeBack(const void* address, Item item) noexcept {
    Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    const auto found = part.items.find(address);
    if (found == part.items.end() || found->second != item) {
        return false;
    }
    part.items.erase(found);
    return true;
}

bool Ledger::has(const void* address) const noexcept {
    const Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    return part.items.count(address) != 0;
}

std::size_t Ledger::count(Item item) const noexcept {
    std::size_t count = 0;
    for (const Part& part : parts) {
        const std::lock_guard<std::mutex> lock(part.mutex);
        count += static_cast<std::size_t>(
            std::count_if(part.items.begin(), part.items.end(),
                          [&](const auto& entry) { return entry.second == item; }));
    }
    return count;
}

}  // namespace simulator
