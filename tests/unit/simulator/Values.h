#pragma once

#include "Driver.h"

namespace drivertest {

// The result of a call: its code, the details if it failed, and the value.
template <typename Value>
struct Answer {
    std::int32_t code = 0;
    std::string text;
    Value value{};
};

template <typename Value>
std::ostream& operator<<(std::ostream& out, const Answer<Value>& answer) {
    return out << answer.code << " " << answer.text << " " << testing::PrintToString(answer.value);
}

template <typename Value>
bool operator==(const Answer<Value>& answer, const Value& expected) {
    return answer.code == 0 && answer.value == expected;
}

template <typename Number>
using Getter = void (*)(Handle, const char*, const char*, Number*, qierr_Status*);
template <typename Number>
using ArrayGetter = void (*)(Handle, const char*, const char*, Number**, std::uint32_t*,
                             qierr_Status*);
template <typename Number>
using Setter = void (*)(Handle, const char*, const char*, Number, qierr_Status*);
template <typename Number>
using ArraySetter = void (*)(Handle, const char*, const char*, const Number*, std::uint32_t,
                             qierr_Status*);

template <typename Number>
Answer<Number> get(Getter<Number> getter, Handle session, const char* resources,
                   const char* property) {
    Answer<Number> answer;
    Status status;
    getter(session, resources, property, &answer.value, &status);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

inline Answer<std::string> getText(Handle session, const char* resources, const char* property) {
    Answer<std::string> answer;
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getGenericPropertyString(session, resources, property, &text, &status);
    answer.value = text != nullptr ? text : "";
    nQITRMCAPI100_freeString(text);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

template <typename Number>
Answer<std::vector<Number>> getArray(ArrayGetter<Number> getter, Handle session,
                                     const char* resources, const char* property) {
    Answer<std::vector<Number>> answer;
    Status status;
    Number* array = nullptr;
    std::uint32_t count = 0;
    getter(session, resources, property, &array, &count, &status);
    answer.value.assign(array, array + count);
    nQITRMCAPI100_freeArray(array);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

inline Answer<Names> getTexts(Handle session, const char* resources, const char* property) {
    Answer<Names> answer;
    Status status;
    char** array = nullptr;
    std::uint32_t count = 0;
    nQITRMCAPI100_getGenericPropertyStringArray(session, resources, property, &array, &count,
                                                &status);
    answer.value = takeNames(array, count);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

// The result of a write: the code and the details.
struct Outcome {
    std::int32_t code;
    std::string text;
};

inline std::ostream& operator<<(std::ostream& out, const Outcome& outcome) {
    return out << outcome.code << " " << outcome.text;
}

template <typename Number>
Outcome set(Setter<Number> setter, Handle session, const char* resources, const char* property,
            Number value) {
    Status status;
    setter(session, resources, property, value, &status);
    return {status.code, status.text()};
}

template <typename Number>
Outcome setArray(ArraySetter<Number> setter, Handle session, const char* resources,
                 const char* property, const std::vector<Number>& values) {
    Status status;
    setter(session, resources, property, values.data(), static_cast<std::uint32_t>(values.size()),
           &status);
    return {status.code, status.text()};
}

constexpr Getter<std::uint8_t> getBool = nQITRMCAPI100_getGenericPropertyBool;
constexpr Getter<double> getDouble = nQITRMCAPI100_getGenericPropertyDouble;
constexpr Getter<std::int32_t> getInt32 = nQITRMCAPI100_getGenericPropertyInt32;
constexpr Getter<std::int64_t> getInt64 = nQITRMCAPI100_getGenericPropertyInt64;
constexpr Getter<std::uint32_t> getUInt32 = nQITRMCAPI100_getGenericPropertyUInt32;
constexpr Getter<std::uint64_t> getUInt64 = nQITRMCAPI100_getGenericPropertyUInt64;
constexpr ArrayGetter<std::uint8_t> getBools = nQITRMCAPI100_getGenericPropertyBoolArray;
constexpr ArrayGetter<double> getDoubles = nQITRMCAPI100_getGenericPropertyDoubleArray;
constexpr ArrayGetter<std::int32_t> getInt32s = nQITRMCAPI100_getGenericPropertyInt32Array;
constexpr ArrayGetter<std::int64_t> getInt64s = nQITRMCAPI100_getGenericPropertyInt64Array;
constexpr ArrayGetter<std::uint32_t> getUInt32s = nQITRMCAPI100_getGenericPropertyUInt32Array;
constexpr ArrayGetter<std::uint64_t> getUInt64s = nQITRMCAPI100_getGenericPropertyUInt64Array;
constexpr Setter<std::uint8_t> setBool = nQITRMCAPI100_setGenericPropertyBool;
constexpr Setter<double> setDouble = nQITRMCAPI100_setGenericPropertyDouble;
constexpr Setter<std::int32_t> setInt32 = nQITRMCAPI100_setGenericPropertyInt32;
constexpr Setter<std::int64_t> setInt64 = nQITRMCAPI100_setGenericPropertyInt64;
constexpr Setter<std::uint32_t> setUInt32 = nQITRMCAPI100_setGenericPropertyUInt32;
constexpr Setter<std::uint64_t> setUInt64 = nQITRMCAPI100_setGenericPropertyUInt64;
constexpr Setter<const char*> setText = nQITRMCAPI100_setGenericPropertyString;
constexpr ArraySetter<std::uint8_t> setBools = nQITRMCAPI100_setGenericPropertyBoolArray;
constexpr ArraySetter<double> setDoubles = nQITRMCAPI100_setGenericPropertyDoubleArray;
constexpr ArraySetter<std::int32_t> setInt32s = nQITRMCAPI100_setGenericPropertyInt32Array;
constexpr ArraySetter<std::int64_t> setInt64s = nQITRMCAPI100_setGenericPropertyInt64Array;
constexpr ArraySetter<std::uint32_t> setUInt32s = nQITRMCAPI100_setGenericPropertyUInt32Array;
constexpr ArraySetter<std::uint64_t> setUInt64s = nQITRMCAPI100_setGenericPropertyUInt64Array;
constexpr ArraySetter<const char*> setTexts = nQITRMCAPI100_setGenericPropertyStringArray;

inline Outcome execute(Handle session, const char* resources, const char* command, double timeout) {
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, resources, command, timeout, &status);
    return {status.code, status.text()};
}

// Restores devices to their state after power-on.
inline std::int32_t resetDevices(Handle session, const char* devices) {
    Status status;
    nQITRMCAPI100_resetDevices(session, devices, &status);
    return status.code;
}

// A test with a session on all modules, which leaves their properties as they are described.
class BenchTest : public testing::Test {
  protected:
    ~BenchTest() override {
        session.reserve("Mod1,Mod2,Mod4,Mod5");
        EXPECT_EQ(resetDevices(session, "Bench,Mod1,Mod2,Mod4,Mod5"), 0);
        setArray(setTexts, session, "Mod1,Mod2,Mod4,Mod5", "Dev.Comment", {"", "", "", ""});
    }

    Session session{"Mod1,Mod2,Mod4,Mod5"};
};

}  // namespace drivertest
