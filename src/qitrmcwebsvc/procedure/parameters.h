#pragma once

#include <cstdint>
#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// Functions that read params which conform to their schema.

// A required text.
std::string textParam(const JsonValue& params, const char* name);
// An optional text, number or Boolean; `absent` is the value if it is missing.
std::string textParam(const JsonValue& params, const char* name, const char* absent);
double doubleParam(const JsonValue& params, const char* name, double absent);
bool boolParam(const JsonValue& params, const char* name, bool absent);

// A required unsigned 32-bit integer.
std::uint32_t uintParam(const JsonValue& params, const char* name);
// "size": the width of a register in bits. The schema compares numbers by value, so 8.0 is accepted
// as 8. Returns 0 for a value that the schema does not allow.
std::uint32_t registerSizeParam(const JsonValue& params);

// The id of the request's session.
std::string sessionIdOf(const JsonValue& params);

// How devices are to be reserved.
struct ReservationParams {
    std::int32_t access;  // 1 read only, 3 read and write
    std::string group;
    double timeout;  // seconds to wait for a device that another session holds
};

ReservationParams reservationParams(const JsonValue& params);

}  // namespace nQITRMCWEBSVC100
