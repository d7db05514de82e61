#pragma once

#include <array>
#include <atomic>
#include <cstddef>

namespace common {

// A few items of one kind, of which each thread uses one. Each lies in cache lines of its own: a
// thread that writes to its item slows down only the few threads that share the item. Items are
// shared when there are more threads than items, so they must be thread-safe.
template <typename Item>
class ThreadShares {
  public:
    // That of the calling thread, always the same one.
    Item& own() noexcept { return shares[threadNumber() % shares.size()].item; }
    const Item& own() const noexcept { return shares[threadNumber() % shares.size()].item; }

    // Calls visit(Item&) for each of them, always in the same order.
    template <typename Visit>
    void forEach(Visit visit) {
        for (Share& share : shares) {
            visit(share.item);
        }
    }
    template <typename Visit>
    void forEach(Visit visit) const {
        for (const Share& share : shares) {
            visit(share.item);
        }
    }

  private:
    static constexpr std::size_t cacheLine = 64;  // bytes, the most that the targets have

    struct alignas(cacheLine) Share {
        Item item{};
    };

    static std::size_t threadNumber() noexcept {
        static std::atomic<std::size_t> next{0};
        thread_local const std::size_t number = next.fetch_add(1, std::memory_order_relaxed);
        return number;
    }

    std::array<Share, 8> shares;
};

}  // namespace common
