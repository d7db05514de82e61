#include "jsonz/jsonz.h"

#include <cstring>

#include "jsonz/scan.h"

using jsonz::skipWhiteSpace;

namespace {

// Skips a key and its colon. Returns the position of the member's value, or null.
const char* readKey(const char* position, jsonz_value* key) {
    const char* p = jsonz::readString(position, key);
    if (p == nullptr) {
        return nullptr;
    }
    p = skipWhiteSpace(p);
    return *p == ':' ? skipWhiteSpace(p + 1) : nullptr;
}

bool isContainer(const jsonz_value& value) {
    return value.type == jsonz_typeArray || value.type == jsonz_typeObject;
}

}  // namespace

const char* jsonz_errorName(std::int32_t error) {
    static constexpr const char* names[] = {
        "jsonz_errorValueExpected",         "jsonz_errorDoubleQuoteExpected",
        "jsonz_errorCurlyBracketExpected",  "jsonz_errorSquareBracketExpected",
        "jsonz_errorColonExpected",         "jsonz_errorCommaExpected",
        "jsonz_errorInvalidStringSequence", "jsonz_errorTrailingComma",
        "jsonz_errorTrailingChar",
    };
    if (error < jsonz_errorValueExpected || error > jsonz_errorTrailingChar) {
        return "unknown";
    }
    return names[error - jsonz_errorValueExpected];
}

const char* jsonz_readValue(const char* position, jsonz_value* value) {
    jsonz_value unwanted;
    if (value == nullptr) {
        value = &unwanted;
    }
    if (position == nullptr) {
        return jsonz::fail(value, nullptr, jsonz_errorValueExpected);
    }
    const char* p = skipWhiteSpace(position);
    if (*p == '{' || *p == '[') {
        return jsonz::readContainer(p, value);
    }
    return jsonz::readScalar(p, value);
}

const char* jsonz_endOfContainer(const char* position) {
    jsonz_value value;
    const char* end = jsonz_readValue(position, &value);
    return isContainer(value) ? end - 1 : nullptr;
}

const char* jsonz_findMember(const char* position, const char* key) {
    if (position == nullptr) {
        return nullptr;
    }
    const char* p = skipWhiteSpace(position);
    char before = '{';
    while (*p == before) {
        jsonz_value name;
        const char* member = readKey(skipWhiteSpace(p + 1), &name);
        if (member == nullptr || jsonz_equals(name.text, name.length, key)) {
            return member;
        }
        p = jsonz_readValue(member, nullptr);
        if (p == nullptr) {
            return nullptr;
        }
        p = skipWhiteSpace(p);
        before = ',';
    }
    return nullptr;
}

const char* jsonz_firstElement(const char* position) {
    if (position == nullptr) {
        return nullptr;
    }
    const char* p = skipWhiteSpace(position);
    if (*p != '[') {
        return nullptr;
    }
    p = skipWhiteSpace(p + 1);
    return *p != ']' && *p != '\0' ? p : nullptr;
}

const char* jsonz_nextElement(const char* position) {
    if (position == nullptr) {
        return nullptr;
    }
    const char* p = skipWhiteSpace(position);
    if (*p != ',') {
        return nullptr;
    }
    p = skipWhiteSpace(p + 1);
    return *p != ']' && *p != '\0' ? p : nullptr;
}

const char* jsonz_getString(const char* position, const char* fallback, std::size_t* length,
                            const char** end) {
    jsonz_value value;
    const char* behind = jsonz_readValue(position, &value);
    if (end != nullptr) {
        *end = behind;
    }
    if (value.type == jsonz_typeString) {
        *length = value.length;
        return value.text;
    }
    *length = fallback != nullptr ? std::strlen(fallback) : 0;
    return fallback;
}
