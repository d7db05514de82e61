#pragma once

#include <string>

#include "qierr/Status.h"

inline bool contains(const qierr::Status& status, const std::string& part) {
    return std::string(status.json).find(part) != std::string::npos;
}
