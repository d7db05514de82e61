#pragma once

#include <qitrmcapi.h>

#include <cstdint>

namespace nQITRMCWEBSVC100 {

// Owners of what the driver lends. Each is filled through its out pointers by a driver call and
// gives everything back at its end, whether the call succeeded or not.

// An array of texts.
class DriverStringArray {
  public:
    DriverStringArray() = default;
    ~DriverStringArray() { nQITRMCAPI100_freeStringArray(array, count); }
    DriverStringArray(const DriverStringArray&) = delete;
    DriverStringArray& operator=(const DriverStringArray&) = delete;

    char*** outArray() { return &array; }
    std::uint32_t* outCount() { return &count; }

    char* const* begin() const { return array; }
    char* const* end() const { return array + (array != nullptr ? count : 0); }

  private:
    char** array = nullptr;
    std::uint32_t count = 0;
};

}  // namespace nQITRMCWEBSVC100
