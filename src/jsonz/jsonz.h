// Folder jsonz: reads JSON text in place, without building a tree.
#pragma once

#include <cstddef>
#include <cstdint>

// Every function takes a position in a NUL-terminated text. A value is described by a record that
// points into that text. For a null position a function returns null or the default. No function
// throws or keeps state, and all may be called from any thread.
//
// Containers are read without recursion, whatever their depth. The kinds of the open containers are
// kept on the stack for the first few thousand levels; only for deeper ones is memory allocated,
// one bit for each level.

enum jsonz_type : std::int32_t {
    jsonz_typeFailure = 0,
    jsonz_typeNull = 1,
    jsonz_typeBoolean = 2,
    jsonz_typeNumber = 3,
    jsonz_typeString = 4,
    jsonz_typeArray = 5,
    jsonz_typeObject = 6,
};

enum jsonz_error : std::int32_t {
    jsonz_errorNone = 0,
    jsonz_errorValueExpected = 1,
    jsonz_errorDoubleQuoteExpected = 2,
    jsonz_errorCurlyBracketExpected = 3,
    jsonz_errorSquareBracketExpected = 4,
    jsonz_errorColonExpected = 5,
    jsonz_errorCommaExpected = 6,
    jsonz_errorInvalidStringSequence = 7,
    jsonz_errorTrailingComma = 8,
    jsonz_errorTrailingChar = 9,
};

// A value that was read. A field is zero unless its comment names the type of the value.
struct jsonz_value {
    jsonz_type type;
    const char* position;  // failure: the position of the error; null inside an object's member
    std::int32_t error;    // failure: a jsonz_error; 0 inside an object's member
    bool boolValue;        // boolean
    bool isReal;           // number: it has a fraction or an exponent
    const char* text;      // number: first character; string: character after the opening quote;
                           // array and object: the opening bracket
    std::size_t length;    // number; string: up to the closing quote, escapes not resolved
};

// The name of a jsonz_error, or "unknown".
const char* jsonz_errorName(std::int32_t error);

// Reads the value at `position`, after optional white space. Returns the position after the value,
// or null after an error. `value` may be null.
//
// Numbers are accepted that JSON does not allow: "-", "01", "1." and "1e+". The text after the
// value is not checked: "nullx" reads as null.
const char* jsonz_readValue(const char* position, jsonz_value* value);

// The closing bracket of the container that opens at `position`, or null.
const char* jsonz_endOfContainer(const char* position);

// The value of the first member named `key` in the object at `position`, or null. Escapes in the
// member's name are resolved before the comparison.
const char* jsonz_findMember(const char* position, const char* key);

// The first element of the array at `position`, or null if it is empty or not an array.
const char* jsonz_firstElement(const char* position);

// The element that follows the one ending at `position`, or null at the end of the array.
const char* jsonz_nextElement(const char* position);

// The string at `position`, escapes not resolved, with its length in bytes. If there is no string,
// `fallback` (which may be null) and its length. `end` may be null; otherwise *end is set to the
// result of jsonz_readValue.
const char* jsonz_getString(const char* position, const char* fallback, std::size_t* length,
                            const char** end = nullptr);

// The number at `position`, truncated to an integer and clamped to 32 bits; `fallback` if there is
// no number. A whole number with a leading 0 is octal. *end as above.
std::int32_t jsonz_getInt(const char* position, std::int32_t fallback, const char** end = nullptr);

// Resolves the escapes of a string of `length` bytes into `output`, which has room for `length` + 1
// bytes, and appends a NUL. Returns the position of that NUL, or null for an invalid escape: the
// output then holds the text before that escape.
char* jsonz_unescape(const char* text, std::size_t length, char* output);

// Whether the string with its escapes resolved equals `plain`. False for an invalid escape.
bool jsonz_equals(const char* text, std::size_t length, const char* plain);
