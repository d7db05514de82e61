#include "lending/Ledger.h"

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
    ++part.uses.try_emplace(address, Use{item}).first->second.loans;
}

Ledger::Return Ledger::takeBack(const void* address, Item item) noexcept {
    Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    const auto found = part.uses.find(address);
    if (found == part.uses.end() || found->second.item != item || found->second.loans == 0) {
        return Return::NotLent;
    }
    --found->second.loans;
    return part.removeUnused(found) ? Return::Unused : Return::StillUsed;
}

void Ledger::keep(const void* address) noexcept {
    Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    part.uses.find(address)->second.isKept = true;
}

bool Ledger::release(const void* address) noexcept {
    Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    const auto found = part.uses.find(address);
    found->second.isKept = false;
    return part.removeUnused(found);
}

bool Ledger::Part::removeUnused(std::unordered_map<const void*, Use>::iterator place) noexcept {
    const bool isUnused = !place->second.isKept && place->second.loans == 0;
    if (isUnused) {
        uses.erase(place);
    }
    return isUnused;
}

bool Ledger::has(const void* address) const noexcept {
    const Part& part = parts[partOf(address)];
    const std::lock_guard<std::mutex> lock(part.mutex);
    return part.uses.count(address) != 0;
}

std::size_t Ledger::count(Item item) const noexcept {
    std::size_t count = 0;
    for (const Part& part : parts) {
        const std::lock_guard<std::mutex> lock(part.mutex);
        for (const auto& [address, use] : part.uses) {
            count += use.item == item ? use.loans : 0;
        }
    }
    return count;
}

}  // namespace simulator
