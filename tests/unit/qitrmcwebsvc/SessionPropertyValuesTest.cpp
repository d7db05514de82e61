// The matrix of typed reads and writes: which function of the driver serves which type and scope.

#include <cmath>
#include <functional>
#include <limits>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SessionProperty.h"
#include "support/ProcedureFixture.h"

using namespace nQITRMCWEBSVC100;

namespace {

constexpr std::int64_t minInt64 = std::numeric_limits<std::int64_t>::min();
constexpr std::uint64_t maxUInt64 = std::numeric_limits<std::uint64_t>::max();

// A read or write: the driver function called in each scope, null where the scope is refused.
struct Row {
    const char* name;
    std::function<void(SessionProperty&)> act;
    const char* system;
    const char* session;
    const char* resources;
    RecordingDriver::Value answer;
    const char* given;  // how a lent value goes back, null where nothing is lent
};

void PrintTo(const Row& row, std::ostream* out) {
    *out << row.name;
}

class TypedOperationTest : public ProcedureFixture, public testing::WithParamInterface<Row> {
  protected:
    // The calls of the operation on a property of this name, or the text of the refusal.
    Calls callsOn(const std::string& name) {
        JsonDocument params;
        params.Parse(R"({"devices":"Mod1"})");
        const auto session =
            std::make_shared<SessionContext>(SessionContext{ResourceKind::None, 0, 7});
        SessionProperty property(session, name, RequestResource(params));
        driver.takeCalls();
        try {
            GetParam().act(property);
        } catch (const nQITRMCSHAREDCMN100::InternalError& error) {
            EXPECT_EQ(driver.takeCalls(), Calls{});
            return {std::to_string(error.status()->code) + error.what()};
        }
        return driver.takeCalls();
    }

    void expectServed(const std::string& property, const char* call) {
        const Calls calls = callsOn(property);
        if (call == nullptr) {
            ASSERT_EQ(calls.size(), 1u);
            EXPECT_EQ(calls[0].rfind("-250800", 0), 0u) << calls[0];
            EXPECT_NE(calls[0].find(R"("comment":"Unsupported property category.")"),
                      std::string::npos)
                << calls[0];
            return;
        }
        Calls expected{call};
        if (GetParam().given != nullptr) {
            expected.push_back(GetParam().given);
        }
        EXPECT_EQ(calls, expected);
    }

    void answer() {
        for (const char* call : {GetParam().system, GetParam().session, GetParam().resources}) {
            if (call != nullptr && std::string(call).rfind("get", 0) == 0) {
                give(call, GetParam().answer);
            }
        }
    }
};

TEST_P(TypedOperationTest, CallsTheDriverFunctionOfEachScope) {
    answer();
    if (std::string(GetParam().name) == "setBoolArray") {
        expectOwnArray();
    }
    expectServed("Sys.Delay", GetParam().system);
    expectServed("Session.Timeout", GetParam().session);
    expectServed("Dev.Own", GetParam().resources);
}

template <typename Value>
auto reads(Value (SessionProperty::*get)() const, Value expected) {
    return [get, expected](SessionProperty& property) { EXPECT_EQ((property.*get)(), expected); };
}

template <typename Value>
auto writes(void (SessionProperty::*set)(const Value&), Value value) {
    return [set, value](SessionProperty& property) { (property.*set)(value); };
}

using P = SessionProperty;
using Bools = std::vector<bool>;
using Doubles = std::vector<double>;
using Int32s = std::vector<std::int32_t>;
using Int64s = std::vector<std::int64_t>;
using UInt32s = std::vector<std::uint32_t>;
using UInt64s = std::vector<std::uint64_t>;

#define SYSTEM(function) #function "(7, \"Sys.Delay\""
#define SESSION(function) #function "(7, \"Session.Timeout\""
#define MOD1(function) #function "(7, \"Mod1\", \"Dev.Own\""

INSTANTIATE_TEST_SUITE_P(
    Reads, TypedOperationTest,
    testing::Values(
        Row{"getBool", reads(&P::getBool, true), SYSTEM(getSystemPropertyBool) ")", nullptr,
            MOD1(getGenericPropertyBool) ")", std::uint64_t{2}, nullptr},
        Row{"getDouble", reads(&P::getDouble, 0.1), SYSTEM(getSystemPropertyDouble) ")",
            SESSION(getSessionPropertyDouble) ")", MOD1(getGenericPropertyDouble) ")", 0.1,
            nullptr},
        Row{"getInt32", reads(&P::getInt32, std::int32_t{-2147483647 - 1}), nullptr, nullptr,
            MOD1(getGenericPropertyInt32) ")", std::int64_t{-2147483648}, nullptr},
        Row{"getInt64", reads(&P::getInt64, minInt64), nullptr, nullptr,
            MOD1(getGenericPropertyInt64) ")", minInt64, nullptr},
        Row{"getString", reads(&P::getString, std::string("volt")), nullptr, nullptr,
            MOD1(getGenericPropertyString) ")", std::string("volt"), "freeString()"},
        Row{"getUInt32", reads(&P::getUInt32, std::uint32_t{4294967295}), nullptr, nullptr,
            MOD1(getGenericPropertyUInt32) ")", std::uint64_t{4294967295}, nullptr},
        Row{"getUInt64", reads(&P::getUInt64, maxUInt64), SYSTEM(getSystemPropertyUInt64) ")",
            nullptr, MOD1(getGenericPropertyUInt64) ")", maxUInt64, nullptr},
        Row{"getBoolArray", reads(&P::getBoolArray, Bools{true, false, true}), nullptr, nullptr,
            MOD1(getGenericPropertyBoolArray) ")", UInt64s{1, 0, 255}, "freeArray()"},
        Row{"getDoubleArray", reads(&P::getDoubleArray, Doubles{0.5, -2}), nullptr, nullptr,
            MOD1(getGenericPropertyDoubleArray) ")", Doubles{0.5, -2}, "freeArray()"},
        Row{"getInt32Array", reads(&P::getInt32Array, Int32s{-1, 2}), nullptr, nullptr,
            MOD1(getGenericPropertyInt32Array) ")", Int64s{-1, 2}, "freeArray()"},
        Row{"getInt64Array", reads(&P::getInt64Array, Int64s{minInt64, 3}), nullptr, nullptr,
            MOD1(getGenericPropertyInt64Array) ")", Int64s{minInt64, 3}, "freeArray()"},
        Row{"getStringArray", reads(&P::getStringArray, Texts{"a", ""}),
            SYSTEM(getSystemPropertyStringArray) ")", SESSION(getSessionPropertyStringArray) ")",
            MOD1(getGenericPropertyStringArray) ")", Texts{"a", ""}, "freeStringArray(2)"},
        Row{"getUInt32Array", reads(&P::getUInt32Array, UInt32s{4294967295, 0}), nullptr, nullptr,
            MOD1(getGenericPropertyUInt32Array) ")", UInt64s{4294967295, 0}, "freeArray()"},
        Row{"getUInt64Array", reads(&P::getUInt64Array, UInt64s{maxUInt64}), nullptr, nullptr,
            MOD1(getGenericPropertyUInt64Array) ")", UInt64s{maxUInt64}, "freeArray()"}),
    [](const auto& row) { return std::string(row.param.name); });

INSTANTIATE_TEST_SUITE_P(
    Writes, TypedOperationTest,
    testing::Values(Row{"setBool",
                        writes(&P::setBool, true),
                        SYSTEM(setSystemPropertyBool) ", 1)",
                        nullptr,
                        MOD1(setGenericPropertyBool) ", 1)",
                        {},
                        nullptr},
                    Row{"setDouble",
                        writes(&P::setDouble, 0.5),
                        SYSTEM(setSystemPropertyDouble) ", 0.5)",
                        SESSION(setSessionPropertyDouble) ", 0.5)",
                        MOD1(setGenericPropertyDouble) ", 0.5)",
                        {},
                        nullptr},
                    Row{"setInt32",
                        writes(&P::setInt32, std::int32_t{-7}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyInt32) ", -7)",
                        {},
                        nullptr},
                    Row{"setInt64",
                        writes(&P::setInt64, minInt64),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyInt64) ", -9223372036854775808)",
                        {},
                        nullptr},
                    // In a session, through the function for resources, with the resources that the
                    // request named.
                    Row{"setString",
                        writes(&P::setString, std::string("x")),
                        nullptr,
                        "setGenericPropertyString(7, \"Mod1\", \"Session.Timeout\", \"x\")",
                        MOD1(setGenericPropertyString) ", \"x\")",
                        {},
                        nullptr},
                    Row{"setUInt32",
                        writes(&P::setUInt32, std::uint32_t{4294967295}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyUInt32) ", 4294967295)",
                        {},
                        nullptr},
                    Row{"setUInt64",
                        writes(&P::setUInt64, maxUInt64),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyUInt64) ", 18446744073709551615)",
                        {},
                        nullptr},
                    Row{"setBoolArray",
                        writes(&P::setBoolArray, Bools{true, false}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyBoolArray) ", [1,0])",
                        {},
                        "freeArray()"},
                    Row{"setDoubleArray",
                        writes(&P::setDoubleArray, Doubles{0.5, 2}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyDoubleArray) ", [0.5,2])",
                        {},
                        nullptr},
                    Row{"setInt32Array",
                        writes(&P::setInt32Array, Int32s{-1, 2}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyInt32Array) ", [-1,2])",
                        {},
                        nullptr},
                    Row{"setInt64Array",
                        writes(&P::setInt64Array, Int64s{minInt64}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyInt64Array) ", [-9223372036854775808])",
                        {},
                        nullptr},
                    Row{"setStringArray",
                        writes(&P::setStringArray, Texts{"a", "b"}),
                        nullptr,
                        SESSION(setSessionPropertyStringArray) ", [\"a\",\"b\"])",
                        MOD1(setGenericPropertyStringArray) ", [\"a\",\"b\"])",
                        {},
                        nullptr},
                    Row{"setUInt32Array",
                        writes(&P::setUInt32Array, UInt32s{4294967295, 1}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyUInt32Array) ", [4294967295,1])",
                        {},
                        nullptr},
                    Row{"setUInt64Array",
                        writes(&P::setUInt64Array, UInt64s{maxUInt64, 0}),
                        nullptr,
                        nullptr,
                        MOD1(setGenericPropertyUInt64Array) ", [18446744073709551615,0])",
                        {},
                        nullptr}),
    [](const auto& row) { return std::string(row.param.name); });

TEST_P(TypedOperationTest, PassesTheDriversErrorOnAndFreesWhatItReturned) {
    RecordingDriver::Reply refusal;
    refusal.value = GetParam().answer;
    refusal.code = -250999;
    refusal.json = R"({"why":"busy"})";
    driver.reply(GetParam().resources, refusal);
    if (std::string(GetParam().name) == "setBoolArray") {
        expectOwnArray();
    }
    try {
        callsOn("Dev.Own");
        FAIL() << "the refusal was lost";
    } catch (const qierr::Exception& error) {
        EXPECT_EQ(error.status()->code, -250999);
        EXPECT_STREQ(error.what(), R"({"why":"busy"})");
    }
    const Calls calls = driver.calls();
    ASSERT_FALSE(calls.empty());
    EXPECT_EQ(calls[0], GetParam().resources);
    EXPECT_EQ(calls.back(), "closeProperty(22)");
}

TEST_P(TypedOperationTest, DropsAWarning) {
    RecordingDriver::Reply warning;
    warning.value = GetParam().answer;
    warning.code = 250999;
    driver.reply(GetParam().resources, warning);
    if (std::string(GetParam().name) == "setBoolArray") {
        expectOwnArray();
    }
    expectServed("Dev.Own", GetParam().resources);
}

}  // namespace
