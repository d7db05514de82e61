#pragma once

#include <cstdint>
#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// One value of an enumeration of the driver, written in a request as a number or as a word.
class EnumType {
  public:
    // Throws InternalError for a value that is neither an integer of the signed 32-bit range nor a
    // text; a schema keeps such values out, but for a whole number written with a fraction.
    EnumType(const JsonValue& value, std::string enumerationName);

    const std::string& name() const { return enumerationName; }
    std::int32_t value() const { return number; }

  private:
    std::string enumerationName;
    std::int32_t number;
};

}  // namespace nQITRMCWEBSVC100
