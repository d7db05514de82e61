#pragma once

#include <string_view>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// The value of an object's first member with this name, or null.
inline const JsonValue* findMember(const JsonValue& object, std::string_view name) {
    for (const auto& [memberName, value] : object.GetObject()) {
        if (std::string_view(memberName.GetString(), memberName.GetStringLength()) == name) {
            return &value;
        }
    }
    return nullptr;
}

}  // namespace nQITRMCWEBSVC100
