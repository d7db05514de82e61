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
