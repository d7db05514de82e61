#pragma once

#include <cstdint>
#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// A value of an enumeration of the driver. A request contains it as a number or by its name.
class EnumType {
  public:
    // Throws InternalError for a value that is neither a signed 32-bit integer nor a text. Schemas
    // reject such values, except a whole number that is written with a fraction.
    EnumType(const JsonValue& value, std::string enumerationName);

    const std::string& name() const { return enumerationName; }
    std::int32_t value() const { return number; }

  private:
    std::string enumerationName;
    std::int32_t number;
};

}  // namespace nQITRMCWEBSVC100
