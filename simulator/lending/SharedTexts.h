#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <optional>
#include <string_view>
#include <vector>

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

// Shared texts that are made when they are first needed, and again after a change.
class TextsOnDemand {
  public:
    // make() returns the texts. Throws what make() throws, and std::bad_alloc. Several threads may
    // call it at the same time.
    template <typename Make>
    const SharedTexts& get(Make make) const {
        const SharedTexts* ready = made.load(std::memory_order_acquire);
        if (ready == nullptr) {
            const std::lock_guard<std::mutex> lock(mutex);
            ready = texts ? &*texts : &texts.emplace(make());
            made.store(ready, std::memory_order_release);
        }
        return *ready;
    }
    // Must not run beside get().
    void discard() noexcept {
        made.store(nullptr, std::memory_order_relaxed);
        texts.reset();
    }

  private:
    mutable std::mutex mutex;
    mutable std::optional<SharedTexts> texts;
    // Null, or the texts.
    mutable std::atomic<const SharedTexts*> made{nullptr};
};

}  // namespace simulator
