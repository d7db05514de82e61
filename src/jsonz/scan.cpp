#include "jsonz/scan.h"

#include <cstring>

namespace jsonz {

const char* skipWhiteSpace(const char* position) {
    while (*position == ' ' || *position == '\t' || *position == '\r' || *position == '\n') {
        ++position;
    }
    return position;
}

const char* fail(jsonz_value* value, const char* position, jsonz_error error) {
    *value = jsonz_value{};
    value->position = position;
    value->error = error;
    return nullptr;
}

namespace {

struct ByteSet {
    bool contains[256];
};

// The bytes that stand for themselves in a string.
constexpr ByteSet plainBytes = [] {
    ByteSet set{};
    for (int byte = 0x20; byte < 256; ++byte) {
        set.contains[byte] = byte != '"' && byte != '\\';
    }
    return set;
}();

const char* skipPlain(const char* position) {
    while (plainBytes.contains[static_cast<unsigned char>(*position)]) {
        ++position;
    }
    return position;
}

const char* skipDigits(const char* position) {
    while (isDigit(*position)) {
        ++position;
    }
    return position;
}

// Skips one escape sequence, starting after the backslash. If it is invalid, sets *valid to false
// and returns the position of the first invalid character.
const char* skipEscape(const char* position, bool* valid) {
    if (*position != 'u') {
        *valid = *position != '\0' && std::strchr("\"/\\bfnrt", *position) != nullptr;
        return *valid ? position + 1 : position;
    }
    ++position;
    for (int digits = 0; digits < 4; ++digits, ++position) {
        if (hexDigit(*position) < 0) {
            *valid = false;
            return position;
        }
    }
    return position;
}

const char* readNumber(const char* position, jsonz_value* value) {
    const char* p = skipDigits(*position == '-' ? position + 1 : position);
    bool isReal = false;
    if (*p == '.') {
        isReal = true;
        p = skipDigits(p + 1);
    }
    if (*p == 'e' || *p == 'E') {
        isReal = true;
        ++p;
        if (*p != '+' && *p != '-' && !isDigit(*p)) {
            return fail(value, p, jsonz_errorNone);
        }
        p = skipDigits(p + 1);
    }
    *value = jsonz_value{};
    value->type = jsonz_typeNumber;
    value->isReal = isReal;
    value->text = position;
    value->length = static_cast<std::size_t>(p - position);
    return p;
}

const char* readKeyword(const char* position, jsonz_value* value) {
    static constexpr struct {
        const char* text;
        std::size_t length;
        jsonz_type type;
        bool boolValue;
    } keywords[] = {
        {"true", 4, jsonz_typeBoolean, true},
        {"false", 5, jsonz_typeBoolean, false},
        {"null", 4, jsonz_typeNull, false},
    };
    for (const auto& keyword : keywords) {
        if (std::strncmp(position, keyword.text, keyword.length) == 0) {
            *value = jsonz_value{};
            value->type = keyword.type;
            value->boolValue = keyword.boolValue;
            return position + keyword.length;
        }
    }
    // Where no value begins, the missing double quote is the error that is reported.
    return fail(value, position, jsonz_errorDoubleQuoteExpected);
}

}  // namespace

const char* readString(const char* position, jsonz_value* value) {
    if (*position != '"') {
        return fail(value, position, jsonz_errorDoubleQuoteExpected);
    }
    const char* p = skipPlain(position + 1);
    for (; *p != '"'; p = skipPlain(p)) {
        if (*p != '\\') {
            return fail(value, p, jsonz_errorDoubleQuoteExpected);
        }
        bool valid = true;
        p = skipEscape(p + 1, &valid);
        if (!valid) {
            return fail(value, p, jsonz_errorInvalidStringSequence);
        }
    }
    *value = jsonz_value{};
    value->type = jsonz_typeString;
    value->text = position + 1;
    value->length = static_cast<std::size_t>(p - value->text);
    return p + 1;
}

const char* readScalar(const char* position, jsonz_value* value) {
    if (*position == '"') {
        return readString(position, value);
    }
    if (*position == '-' || isDigit(*position)) {
        return readNumber(position, value);
    }
    return readKeyword(position, value);
}

}  // namespace jsonz
