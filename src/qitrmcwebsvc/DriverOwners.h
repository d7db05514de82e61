#pragma once

#include <qitrmcapi.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <iterator>
#include <new>
#include <string>

#include "qierr/Status.h"

namespace nQITRMCWEBSVC100 {

// Owners of the memory and handles that driver functions return. A driver call fills an owner
// through its out pointers; the destructor frees the contents, whether the call succeeded or not.

// An array of texts. A null text is read as an empty one.
class DriverStringArray {
  public:
    class Iterator {
      public:
        using iterator_category = std::input_iterator_tag;
        using value_type = const char*;
        using difference_type = std::ptrdiff_t;
        using pointer = const char* const*;
        using reference = const char*;

        explicit Iterator(char* const* place) : place(place) {}
        const char* operator*() const { return *place != nullptr ? *place : ""; }
        Iterator& operator++() {
            ++place;
            return *this;
        }
        Iterator operator++(int) { return Iterator(place++); }
        bool operator==(const Iterator& other) const { return place == other.place; }
        bool operator!=(const Iterator& other) const { return place != other.place; }

      private:
        char* const* place;
    };

    DriverStringArray() = default;
    ~DriverStringArray() { nQITRMCAPI100_freeStringArray(array, count); }
    DriverStringArray(const DriverStringArray&) = delete;
    DriverStringArray& operator=(const DriverStringArray&) = delete;

    char*** outArray() { return &array; }
    std::uint32_t* outCount() { return &count; }

    std::uint32_t size() const { return array != nullptr ? count : 0; }
    const char* operator[](std::uint32_t position) const { return *Iterator(array + position); }
    Iterator begin() const { return Iterator(array); }
    Iterator end() const { return Iterator(array + size()); }

  private:
    char** array = nullptr;
    std::uint32_t count = 0;
};

// An array of numbers, or of Booleans of one byte each.
template <typename Element>
class DriverArray {
  public:
    DriverArray() = default;
    // An array that this program allocates. The driver frees it like its own, since both are
    // allocated with malloc. The elements are not initialised.
    explicit DriverArray(std::uint32_t count)
        : array(static_cast<Element*>(std::malloc(count * sizeof(Element)))), count(count) {
        if (array == nullptr && count != 0) {
            throw std::bad_alloc();
        }
    }
    ~DriverArray() { nQITRMCAPI100_freeArray(array); }
    DriverArray(const DriverArray&) = delete;
    DriverArray& operator=(const DriverArray&) = delete;

    Element** outArray() { return &array; }
    std::uint32_t* outCount() { return &count; }

    Element* data() { return array; }
    const Element* begin() const { return array; }
    const Element* end() const { return array + (array != nullptr ? count : 0); }

  private:
    Element* array = nullptr;
    std::uint32_t count = 0;
};

// A text.
class DriverString {
  public:
    DriverString() = default;
    ~DriverString() { nQITRMCAPI100_freeString(text); }
    DriverString(const DriverString&) = delete;
    DriverString& operator=(const DriverString&) = delete;

    char** out() { return &text; }

    // Null if the driver returned no text.
    const char* get() const { return text; }
    // A copy, empty if the driver returned no text.
    std::string copy() const { return text != nullptr ? text : ""; }

  private:
    char* text = nullptr;
};

// An open handle, or 0. A failure to close it is ignored: by then the operation has either
// succeeded or failed for another reason.
template <void (*close)(std::uint32_t handle, qierr_Status* status)>
class DriverHandle {
  public:
    DriverHandle() = default;
    ~DriverHandle() {
        if (handle == 0) {
            return;
        }
        qierr::Status status;
        close(handle, &status);
    }
    DriverHandle(const DriverHandle&) = delete;
    DriverHandle& operator=(const DriverHandle&) = delete;

    std::uint32_t* out() { return &handle; }
    std::uint32_t get() const { return handle; }

  private:
    std::uint32_t handle = 0;
};

using DriverProperty = DriverHandle<nQITRMCAPI100_closeProperty>;
using DriverCommand = DriverHandle<nQITRMCAPI100_closeCommand>;

}  // namespace nQITRMCWEBSVC100
