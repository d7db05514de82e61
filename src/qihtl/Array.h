#pragma once

#include <cstdint>
#include <new>
#include <type_traits>
#include <utility>

#include "qihtl/Allocator.h"

namespace qihtl {

// An array that reports a failed allocation in a status (qiapalerr_memoryFull) instead of throwing.
// An operation that takes a status does nothing if the status is already negative. An array cannot
// be copied and may be used by one thread at a time.
template <typename T>
class Array {
    static_assert(std::is_nothrow_move_constructible_v<T>, "growing moves the elements");

  public:
    Array() noexcept = default;
    ~Array() {
        clear();
        qihtl_realloc(elements, 0);
    }
    Array(const Array&) = delete;
    Array& operator=(const Array&) = delete;

    std::uint32_t length() const noexcept { return used; }
    std::uint32_t capacity() const noexcept { return room; }
    T* begin() noexcept { return elements; }
    T* end() noexcept { return elements + used; }
    const T* begin() const noexcept { return elements; }
    const T* end() const noexcept { return elements + used; }
    T& operator[](std::uint32_t index) noexcept { return elements[index]; }
    const T& operator[](std::uint32_t index) const noexcept { return elements[index]; }

    // Allocates room for exactly `wanted` elements unless the capacity suffices.
    void reserve(std::uint32_t wanted, qierr_Status* status) {
        if (status->code < 0 || wanted <= room) {
            return;
        }
        if (wanted > 0x7FFFFFFFu / sizeof(T)) {
            qihtl_reportMemoryFull(status);
            return;
        }
        moveTo(wanted, status);
    }

    // Appends an element. On failure the array is unchanged and `element` is destroyed.
    void append(T element, qierr_Status* status) {
        if (status->code < 0) {
            return;
        }
        if (used == room) {
            const std::uint64_t needed = std::uint64_t{used} + 1;
            const std::uint32_t grown = qihtl_grownCapacity(room, needed, sizeof(T));
            if (grown == 0) {
                qihtl_reportMemoryFull(status);
                return;
            }
            moveTo(grown, status);
            if (status->code < 0) {
                return;
            }
        }
        new (elements + used) T(std::move(element));
        ++used;
    }

    // Return and remove the last element. The array must not be empty.
    T& last() noexcept { return elements[used - 1]; }
    void removeLast() noexcept { elements[--used].~T(); }

    // Destroys the elements in order. The capacity does not change.
    void clear() noexcept {
        for (std::uint32_t index = 0; index < used; ++index) {
            elements[index].~T();
        }
        used = 0;
    }

  private:
    void moveTo(std::uint32_t capacity, qierr_Status* status) {
        T* moved = static_cast<T*>(qihtl_realloc(nullptr, capacity * sizeof(T)));
        if (moved == nullptr) {
            qihtl_reportMemoryFull(status);
            return;
        }
        for (std::uint32_t index = 0; index < used; ++index) {
            new (moved + index) T(std::move(elements[index]));
            elements[index].~T();
        }
        qihtl_realloc(elements, 0);
        elements = moved;
        room = capacity;
    }

    T* elements = nullptr;
    std::uint32_t room = 0;
    std::uint32_t used = 0;
};

}  // namespace qihtl
