#include "lending/Ledger.h"

#include <algorithm>
#include <new>

namespace simulator {

Ledger& Ledger::instance() {
    // Never destroyed, as items may be returned until the very end of the process; and created
    // without allocation, as returning cannot fail.
    alignas(Ledger) static unsigned char place[sizeof(Ledger)];
    static Ledger& ledger = *new (place) Ledger;
    return ledger;
}

void Ledger::lend(const void* address, Item item) {
    const std::lock_guard<std::mutex> lock(mutex);
    items.emplace(address, item);
}

bool Ledger::takeBack(const void* address, Item item) noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = items.find(address);
    if (found == items.end() || found->second != item) {
        return false;
    }
    items.erase(found);
    return true;
}

bool Ledger::has(const void* address) const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return items.count(address) != 0;
}

size_t Ledger::count(Item item) const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return static_cast<size_t>(std::count_if(
        items.begin(), items.end(), [&](const auto& entry) { return entry.second == item; }));
}

}  // namespace simulator
