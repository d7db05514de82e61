#pragma once

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// The value of an object's first member with this name, or null.
inline const JsonValue* findMember(const JsonValue& object, const char* name) {
    const auto member = object.FindMember(name);
    return member == object.MemberEnd() ? nullptr : &member->value;
}

}  // namespace nQITRMCWEBSVC100
