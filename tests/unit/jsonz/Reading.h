#pragma once

#include <gtest/gtest.h>

#include <string>

#include "jsonz/jsonz.h"

namespace jsonz_test {

// One call of jsonz_readValue, positions turned into offsets.
struct Reading {
    explicit Reading(const char* source) : text(source) {
        const char* end = jsonz_readValue(text, &value);
        consumed = end != nullptr ? end - text : -1;
    }

    long offset(const char* position) const { return position != nullptr ? position - text : -1; }
    std::string valueText() const { return std::string(value.text, value.length); }

    const char* text;
    jsonz_value value;
    long consumed;
};

inline void expectFault(const char* text, long position, std::int32_t error) {
    SCOPED_TRACE(text);
    const Reading reading(text);
    EXPECT_EQ(reading.consumed, -1);
    EXPECT_EQ(reading.value.type, jsonz_typeFailure);
    EXPECT_EQ(reading.offset(reading.value.position), position);
    EXPECT_EQ(reading.value.error, error);
}

// Expects a failure that is reported without details.
inline void expectBareFault(const char* text) {
    expectFault(text, -1, 0);
}

}  // namespace jsonz_test
