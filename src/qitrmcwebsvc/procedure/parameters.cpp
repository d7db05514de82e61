#include "qitrmcwebsvc/procedure/parameters.h"

#include "qitrmcwebsvc/EnumType.h"
#include "qitrmcwebsvc/findMember.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr std::int32_t readWriteAccess = 3;

std::string textOf(const JsonValue& value) {
    return std::string(value.GetString(), value.GetStringLength());
}

std::int32_t accessParam(const JsonValue& params) {
    const JsonValue* access = findMember(params, "access");
    return access == nullptr ? readWriteAccess : EnumType(*access, "ReservationAccess").value();
}

}  // namespace

std::string textParam(const JsonValue& params, const char* name) {
    return textOf(params[name]);
}

std::string textParam(const JsonValue& params, const char* name, const char* absent) {
    const JsonValue* value = findMember(params, name);
    return value == nullptr ? std::string(absent) : textOf(*value);
}

double doubleParam(const JsonValue& params, const char* name, double absent) {
    const JsonValue* value = findMember(params, name);
    return value == nullptr ? absent : value->GetDouble();
}

bool boolParam(const JsonValue& params, const char* name, bool absent) {
    const JsonValue* value = findMember(params, name);
    return value == nullptr ? absent : value->IsTrue();
}

std::uint32_t uintParam(const JsonValue& params, const char* name) {
    return params[name].GetUint();
}

std::uint32_t registerSizeParam(const JsonValue& params) {
    const JsonValue& size = params["size"];
    for (const std::uint32_t width : {8u, 16u, 32u, 64u}) {
        if (size.IsNumber() && size.GetDouble() == width) {
            return width;
        }
    }
    return 0;
}

std::string sessionIdOf(const JsonValue& params) {
    return textParam(params, "session_id");
}

ReservationParams reservationParams(const JsonValue& params) {
    // The first invalid parameter in this order determines the error.
    const std::int32_t access = accessParam(params);
    return {access, textParam(params, "reservation_group", ""),
            doubleParam(params, "reservation_timeout", 0.0)};
}

}  // namespace nQITRMCWEBSVC100
