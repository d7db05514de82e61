#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <optional>
#include <string_view>
#include <vector>

#include "common/ThreadShares.h"

namespace simulator {

// An array of texts that is lent to any number of callers at the same time, who only read it.
class SharedTexts {
  public:
    // Throws std::bad_alloc. No text is null.
    explicit SharedTexts(const std::vector<std::string_view>& texts);
    SharedTexts(const SharedTexts&) = delete;
    SharedTexts& operator=(const SharedTexts&) = delete;
    // What is lent stays valid until it is taken back.
    ~SharedTexts();

    // Returns null for no texts. Any thread may call it.
    char** lend() const noexcept;
    std::uint32_t count() const { return size; }

  private:
    char** const array;
    const std::uint32_t size;
};

// Shared texts that are made when they are first needed, and again after a change. Several threads
// get several copies, since each loan of the same memory is counted in the same place.
class TextsOnDemand {
  public:
    // make() returns the texts. Throws what make() throws, and std::bad_alloc. Several threads may
    // call it at the same time.
    template <typename Make>
    const SharedTexts& get(Make make) const {
        Copy& copy = copies.own();
        const SharedTexts* ready = copy.made.load(std::memory_order_acquire);
        if (ready == nullptr) {
            const std::lock_guard<std::mutex> lock(copy.mutex);
            ready = copy.texts ? &*copy.texts : &copy.texts.emplace(make());
            copy.made.store(ready, std::memory_order_release);
        }
        return *ready;
    }
    // Must not run beside get().
    void discard() noexcept {
        copies.forEach([](Copy& copy) {
            copy.made.store(nullptr, std::memory_order_relaxed);
            copy.texts.reset();
        });
    }

  private:
    struct Copy {
        std::mutex mutex;
        std::optional<SharedTexts> texts;
        // Null, or the texts.
        std::atomic<const SharedTexts*> made{nullptr};
    };

    mutable common::ThreadShares<Copy> copies;
};

}  // namespace simulator
