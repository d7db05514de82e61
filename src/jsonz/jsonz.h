#pragma once

#include <cstddef>
#include <cstdint>

// A JSON reader that works on the text itself.
//
// Every operation takes a position in NUL-terminated text and builds no tree: a value is described
// by a record that points back into the text. Operations take null for a position and answer with
// null or the default. None throws, none keeps state, and all may run on any thread.
//
// Containers are read without recursion, however deep they nest. Nesting is remembered on the stack
// down to a depth of some thousand levels; only beyond that is memory allocated, one bit a level.

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

// What was read. The fields beyond `type` are zero where a comment does not name the type.
struct jsonz_value {
    jsonz_type type;
    const char* position;  // failure: the place of the fault; null inside an object's member
    std::int32_t error;    // failure: a jsonz_error; 0 inside an object's member
    bool boolValue;        // boolean
    bool isReal;           // number: it has a fraction or an exponent
    const char* text;      // number: first character; string: behind the opening quote; array and
                           // object: the opening bracket
    std::size_t length;    // number; string: up to the closing quote, escapes left in place
};

// The name of a jsonz_error, or "unknown".
const char* jsonz_errorName(std::int32_t error);

// Reads the value at `position`, white space before it allowed. Returns the position behind the
// value, or null after a fault. `value` may be null.
//
// Numbers are read more loosely than JSON has them: "-", "01", "1." and "1e+" pass. What follows
// the value is not looked at: "nullx" reads as null.
const char* jsonz_readValue(const char* position, jsonz_value* value);

// The closing bracket of the container that opens at `position`, or null.
const char* jsonz_endOfContainer(const char* position);

// The value of the first member named `key` in the object at `position`, or null. Escapes in the
// member's name are resolved before the comparison.
const char* jsonz_findMember(const char* position, const char* key);

// The first element of the array at `position`, or null if it is empty or is no array.
const char* jsonz_firstElement(const char* position);

// The element that follows the one ending at `position`, or null at the end of the array.
const char* jsonz_nextElement(const char* position);

// The string at `position`, escapes left in place, with its length in bytes; `fallback` (which may
// be null) with its own length when there is no string. *end, if wanted, is what jsonz_readValue
// returned.
const char* jsonz_getString(const char* position, const char* fallback, std::size_t* length,
                            const char** end = nullptr);

// The number at `position`, a fraction cut off and the range of 32 bits kept by saturation;
// `fallback` when there is none. A whole number with a leading 0 is octal. *end as above.
std::int32_t jsonz_getInt(const char* position, std::int32_t fallback, const char** end = nullptr);

// Resolves the escapes of a string of `length` bytes into `output`, which has room for `length` + 1
// bytes, and ends it with a NUL. Returns the position of that NUL, or null after a fault: the
// output then holds what came before it.
char* jsonz_unescape(const char* text, std::size_t length, char* output);

// True if the string, its escapes resolved, is `plain`. A string with a faulty escape equals none.
bool jsonz_equals(const char* text, std::size_t length, const char* plain);
