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

// Owners of what the driver lends. Each is filled through its out pointers by a driver call and
// gives everything back at its end, whether the call succeeded or not.

// An array of texts. A text that the driver left out is read as an empty one.
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

    Iterator begin() const { return Iterator(array); }
    Iterator end() const { return Iterator(array + (array != nullptr ? count : 0)); }

  private:
    char** array = nullptr;
    std::uint32_t count = 0;
};

// An array of numbers, or of truth values of one byte each.
template <typename Element>
class DriverArray {
  public:
    DriverArray() = default;
    // An array of the program's own, which the driver takes back like one that it lent: both come
    // from malloc. Its elements are not set.
    explicit DriverArray(std::uint32_t count)
        : array(static_cast<Element*>(std::malloc(count * sizeof(Element)))), count(count) {
        if (array == nullptr && count != 0)
            throw std::bad_alloc();
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

    // Null when the driver gave none.
    const char* get() const { return text; }
    // A copy, empty when the driver gave none.
    std::string copy() const { return text != nullptr ? text : ""; }

  private:
    char* text = nullptr;
};

// An open handle, 0 when there is none. What its closing reports is dropped: the work is done, or
// has failed for a reason of its own.
template <void (*close)(std::uint32_t handle, qierr_Status* status)>
class DriverHandle {
  public:
    DriverHandle() = default;
    ~DriverHandle() {
        if (handle == 0)
            return;
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
