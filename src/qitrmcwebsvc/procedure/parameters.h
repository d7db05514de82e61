#pragma once

#include <cstdint>
#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// Reading of params that have passed their schema.

// A required text.
std::string textParam(const JsonValue& params, const char* name);
// An optional text, number of any form, or truth value.
std::string textParam(const JsonValue& params, const char* name, const char* absent);
double doubleParam(const JsonValue& params, const char* name, double absent);
bool boolParam(const JsonValue& params, const char* name, bool absent);

// A required integer of the unsigned 32-bit range.
std::uint32_t uintParam(const JsonValue& params, const char* name);
// The width of a register in bits, "size". The schema compares numbers by value, so 8.0 is 8 here
// too; 0 for what it should have kept out.
std::uint32_t registerSizeParam(const JsonValue& params);

// The session that the request is about.
std::string sessionIdOf(const JsonValue& params);

// How a client wants to hold devices.
struct ReservationParams {
    std::int32_t access;  // 1 read only, 3 read and write
    std::string group;
    double timeout;  // seconds to wait for a device that is taken
};

ReservationParams reservationParams(const JsonValue& params);

}  // namespace nQITRMCWEBSVC100
