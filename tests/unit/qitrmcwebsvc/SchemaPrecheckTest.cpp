#include "qitrmcwebsvc/SchemaPrecheck.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "qitrmcwebsvc/SchemaRun.h"
#include "qitrmcwebsvc/requestText.h"
#include "support/allocationFaults.h"

namespace nQITRMCWEBSVC100 {
namespace {

using Verdict = SchemaPrecheck::Verdict;

constexpr Verdict valid = Verdict::Valid;
constexpr Verdict invalid = Verdict::Invalid;
constexpr Verdict undecided = Verdict::Undecided;

const std::string definitions =
    R"("definitions":{"small":{"type":"integer","maximum":9},"same":{"$ref":"#/definitions/small"},)"
    R"("tree":{"type":"object","properties":{"child":{"$ref":"#/definitions/tree"}}},"a~b":{}})";

// The verdict on a request, which the JSON library must confirm unless it is Undecided.
Verdict verdictOn(const std::string& schemaText, const std::string& requestText) {
    JsonDocument schema;
    JsonDocument request;
    schema.Parse(schemaText.c_str());
    EXPECT_FALSE(schema.HasParseError()) << schemaText;
    parseRequestText(requestText, request);
    const Verdict verdict = SchemaPrecheck(schema).verdictOn(request);
    if (verdict != Verdict::Undecided) {
        const JsonSchemaDocument compiled(schema);
        EXPECT_EQ(verdict == Verdict::Valid, SchemaRun(compiled).accepts(request)) << requestText;
    }
    return verdict;
}

// `schema` describes the member "v" of a request, which is `value`.
Verdict verdictOnMember(const std::string& schema, const std::string& value) {
    return verdictOn("{" + definitions + R"(,"properties":{"v":)" + schema + "}}",
                     R"({"v":)" + value + "}");
}

void expectAll(Verdict expected, const std::string& schema,
               const std::vector<std::string>& values) {
    for (const std::string& value : values) {
        EXPECT_EQ(verdictOnMember(schema, value), expected) << schema << " " << value;
    }
}

TEST(SchemaPrecheck, AcceptsAnyValueWithoutASchema) {
    expectAll(valid, "{}",
              {"null", "true", "-1", "1.5", "\"\"", "[[[[{}]]]]", R"({"a":{"b":[]}})"});
}

TEST(SchemaPrecheck, DistinguishesAllTypes) {
    const std::vector<std::pair<std::string, std::vector<std::string>>> values = {
        {"null", {"null"}},
        {"boolean", {"true", "false"}},
        {"object", {"{}", R"({"a":1})"}},
        {"array", {"[]", "[1]"}},
        {"string", {"\"\"", "\"\\u0000\"", "\"\xff\""}},
        {"integer",
         {"0", "-0", "-1", "4294967296", "-9223372036854775808", "18446744073709551615"}},
    };
    for (const auto& [type, own] : values) {
        for (const auto& [other, fitting] : values) {
            expectAll(type == other ? valid : invalid, R"({"type":")" + type + "\"}", fitting);
        }
    }
}

TEST(SchemaPrecheck, TakesANumberInAnotherNotationForADouble) {
    const std::vector<std::string> fractions = {"1.0",  "1e1",   "-0.0",
                                                "1e-9", "1e308", "18446744073709551616"};
    expectAll(invalid, R"({"type":"integer"})", fractions);
    expectAll(valid, R"({"type":"number"})", fractions);
    expectAll(valid, R"({"type":"number"})", {"0", "-1", "18446744073709551615"});
}

TEST(SchemaPrecheck, LeavesOtherTypesUndecided) {
    expectAll(undecided, R"({"type":["string","null"]})", {"\"\"", "5"});
    expectAll(undecided, R"({"type":"Integer"})", {"1"});
}

TEST(SchemaPrecheck, ComparesNumbersWithBothLimits) {
    const std::string limits = R"({"minimum":1,"maximum":4294967295})";
    expectAll(valid, limits, {"1", "4294967295", "1.0", "4294967295.0", "\"text\"", "[]"});
    expectAll(invalid, limits,
              {"0", "-1", "0.9999999999999999", "4294967295.0000005", "4294967296",
               "-9223372036854775808", "9223372036854775807", "9223372036854775808",
               "18446744073709551615", "1e308", "-1e308"});
    expectAll(valid, R"({"minimum":0})", {"-0", "-0.0", "5e-324", "1e308", "18446744073709551615"});
    expectAll(invalid, R"({"minimum":0})", {"-5e-324", "-1"});
    expectAll(invalid, R"({"minimum":-2.5,"maximum":2.5})", {"3", "-3", "2.6"});
    expectAll(valid, R"({"minimum":-2.5,"maximum":2.5})", {"2", "-2", "2.5"});
}

TEST(SchemaPrecheck, LeavesLimitsUndecidedThatDoublesBlur) {
    expectAll(valid, R"({"maximum":9007199254740991})", {"9007199254740991"});
    expectAll(invalid, R"({"maximum":9007199254740991})", {"9007199254740992"});
    expectAll(undecided, R"({"maximum":9007199254740992})", {"9007199254740993", "1"});
    expectAll(undecided, R"({"minimum":-9007199254740992})", {"-9007199254740993"});
    expectAll(undecided, R"({"maximum":18446744073709551615})", {"1"});
    expectAll(undecided, R"({"maximum":"5"})", {"1"});
}

TEST(SchemaPrecheck, FindsValuesInAnEnum) {
    expectAll(valid, R"({"enum":[8,"ReadOnly",-1]})", {"8", "-1", "\"ReadOnly\""});
    // The library accepts the first two.
    expectAll(undecided, R"({"enum":[8,"ReadOnly",-1]})",
              {"8.0", "8e0", "8.5", "7", "\"8\"", "\"ReadOnly\\u0000\"", "\"Read\"", "null", "[8]",
               "{}"});
}

TEST(SchemaPrecheck, LeavesEnumsOfOtherTypesUndecided) {
    expectAll(undecided, R"({"enum":[1,2.5]})", {"1"});
    expectAll(undecided, R"({"enum":[true]})", {"true"});
    expectAll(undecided, R"({"enum":[]})", {"1"});
    expectAll(undecided, R"({"enum":1})", {"1"});
}

TEST(SchemaPrecheck, MatchesALiteralWithDigits) {
    const std::string pattern = R"({"pattern":"^_session[0-9]+$"})";
    expectAll(valid, pattern, {"\"_session0\"", "\"_session12345678901234567890\"", "5", "[]"});
    // The library accepts the last three.
    expectAll(
        undecided, pattern,
        {"\"\"", "\"_session\"", "\"_sessionX\"", "\"_session1 \"", "\"x_session1\"",
         "\"_session1\\n\"", "\"_session1\\u0000x\"", "\"_session1\\u0000\"", "\"_session1\xe2\""});
}

TEST(SchemaPrecheck, MatchesALiteralAlone) {
    expectAll(valid, R"({"pattern":"^closeSession$"})", {"\"closeSession\""});
    expectAll(undecided, R"({"pattern":"^closeSession$"})",
              {"\"\"", "\"closeSession1\"", "\"closeSessio\"", "\"CloseSession\"",
               "\"closeSession\\u0000\""});
}

TEST(SchemaPrecheck, MatchesLiteralsOfAllPlainCharactersAndNoOthers) {
    expectAll(valid, R"({"pattern":"^AZaz09_$"})", {"\"AZaz09_\""});
    for (const char c : {'@', '[', '`', '{', '/', ':', '^', '-'}) {
        expectAll(undecided, std::string(R"({"pattern":"^)") + c + "$\"}",
                  {std::string("\"") + c + '"'});
    }
}

TEST(SchemaPrecheck, MatchesPatternsWithoutALiteral) {
    expectAll(valid, R"({"pattern":"^$"})", {"\"\""});
    expectAll(undecided, R"({"pattern":"^$"})", {"\"a\"", "\"1\""});
    expectAll(valid, R"({"pattern":"^[0-9]+$"})", {"\"7\""});
    expectAll(undecided, R"({"pattern":"^[0-9]+$"})", {"\"\"", "\"a\""});
}

TEST(SchemaPrecheck, LeavesOtherPatternsUndecided) {
    for (const char* pattern : {"^a.c$", "abc", "^abc", "abc$", "^a|b$", "^a[0-9]*$", "^[0-9]+a$",
                                "^a[0-9]+[0-9]+$", "^", "$", "", "^a\\\\$", "^a$$"}) {
        expectAll(undecided, std::string(R"({"pattern":")") + pattern + "\"}",
                  {"\"a\"", "\"abc\"", "\"a1\"", "\"\""});
    }
    expectAll(undecided, R"({"pattern":"abc$"})", {"\"bc\""});
    expectAll(undecided, R"({"pattern":5})", {"\"a\""});
}

TEST(SchemaPrecheck, CountsAndChecksTheItemsOfAnArray) {
    const std::string schema = R"({"items":{"type":"integer","maximum":255},"minItems":2})";
    expectAll(valid, schema, {"[0,255]", "[1,2,3]", "5", "{}"});
    expectAll(invalid, schema,
              {"[]", "[1]", "[1,256]", "[256,1]", "[1,1.0]", "[1,null]", "[1,[]]"});
}

TEST(SchemaPrecheck, LeavesOtherItemsUndecided) {
    expectAll(undecided, R"({"items":[{"type":"null"}]})", {"[1]", "[null]"});
    expectAll(undecided, R"({"minItems":1.0})", {"[1]"});
    expectAll(undecided, R"({"minItems":-1})", {"[1]"});
}

TEST(SchemaPrecheck, ChecksTheMembersOfAnObject) {
    const std::string schema =
        R"({"properties":{"a":{"type":"null"},"b":{}},"additionalProperties":false,)"
        R"("required":["b"]})";
    expectAll(valid, schema, {R"({"b":1})", R"({"b":1,"a":null})", R"({"\u0062":[[]]})", "5"});
    expectAll(invalid, schema,
              {"{}", R"({"a":null})", R"({"b":1,"a":1})", R"({"B":1})", R"({"b\u0000":1})"});
    // The library refuses a member that is in neither `properties` nor `required`.
    expectAll(undecided, schema,
              {R"({"b":1,"c":1})", R"({"c":1,"b":1})", R"({"b":1,"":1})", R"({"b":1,"b\u0000":1})",
               "{\"b\":1,\"a\xff\":null}"});
}

TEST(SchemaPrecheck, AllowsOtherMembersUnlessTheyAreForbidden) {
    expectAll(valid, R"({"properties":{"a":{"type":"null"}},"additionalProperties":true})",
              {"{}", R"({"c":[[[[]]]]})"});
    expectAll(undecided, R"({"additionalProperties":{}})", {"{}"});
    // The library accepts members that are named in `required` alone.
    expectAll(undecided, R"({"required":["r"],"additionalProperties":false})", {R"({"r":1})"});
}

TEST(SchemaPrecheck, ChecksEachOfSeveralMembersWithTheSameName) {
    const std::string schema = R"({"properties":{"a":{"type":"null"}},"required":["a"]})";
    expectAll(valid, schema, {R"({"a":null,"a":null})"});
    expectAll(invalid, schema, {R"({"a":null,"a":1})", R"({"a":1,"a":null})"});
}

TEST(SchemaPrecheck, LeavesOtherPropertiesUndecided) {
    expectAll(undecided, R"({"properties":[]})", {"{}"});
    expectAll(undecided, R"({"properties":{"a":5}})", {R"({"a":1})"});
    expectAll(undecided, R"({"properties":{"a":{"type":"null"},"a":{}}})", {R"({"a":1})"});
    expectAll(undecided, R"({"required":"a"})", {"{}"});
    expectAll(undecided, R"({"required":["a",5]})", {R"({"a":1})"});
}

TEST(SchemaPrecheck, RequiresThatExactlyOneAlternativeIsValid) {
    const std::string schema =
        R"({"oneOf":[{"type":"integer"},{"maximum":5,"type":"number"},{"type":"array",)"
        R"("items":{"type":"null"}},{"type":"array","items":{"type":"string"}}]})";
    expectAll(valid, schema, {"6", "5.0", "[null]", R"(["",""])"});
    expectAll(invalid, schema, {"5", "5.5", "\"\"", "[]", R"([null,""])", "[1]"});
    expectAll(undecided, R"({"oneOf":[{"type":"integer"},{"multipleOf":2}]})", {"1", "2"});
    expectAll(undecided, R"({"oneOf":[{"multipleOf":2},{"type":"integer"}]})", {"1", "2"});
    expectAll(invalid, R"({"minimum":5,"oneOf":[{"type":"integer"}]})", {"4"});
    expectAll(undecided, R"({"pattern":"^a$","oneOf":[{"type":"string"}]})", {"\"b\""});
    expectAll(undecided, R"({"oneOf":[]})", {"1"});
    expectAll(undecided, R"({"oneOf":[5]})", {"1"});
}

TEST(SchemaPrecheck, AcceptsNoneOrOneOfExclusiveMembers) {
    const std::string schema = R"({"oneOf":[{"required":["a"]},{"required":["b"]},)"
                               R"({"properties":{"a":{"not":{}},"b":{"not":{}}}}]})";
    expectAll(valid, schema, {"{}", R"({"a":[[]]})", R"({"b":null,"c":1})", R"({"a":1,"a":2})"});
    expectAll(invalid, schema, {R"({"a":1,"b":1})", R"({"b":1,"c":1,"a":1})"});
}

TEST(SchemaPrecheck, NegatesOnlyTheEmptySchema) {
    expectAll(invalid, R"({"not":{}})", {"null", "1", "{}", "[[[]]]"});
    expectAll(invalid, R"({"not":{},"type":"integer"})", {"1"});
    expectAll(undecided, R"({"not":{"type":"null"}})", {"null", "1"});
    expectAll(undecided, R"({"not":5})", {"1"});
}

TEST(SchemaPrecheck, FollowsReferencesToDefinitions) {
    for (const char* name : {"small", "same"}) {
        const std::string schema = std::string(R"({"$ref":"#/definitions/)") + name + "\"}";
        expectAll(valid, schema, {"9"});
        expectAll(invalid, schema, {"10", "\"\""});
    }
    // The library ignores keywords beside a reference.
    expectAll(valid, R"({"$ref":"#/definitions/small","minimum":5})", {"1"});
}

TEST(SchemaPrecheck, LeavesOtherReferencesUndecided) {
    for (const char* reference :
         {"#/definitions/none", "#/definitions/a~b", "#/definitions/a~0b", "#/definitions/sm%61ll",
          "#/definitions/small/type", "#/definitions/", "#/properties/v", "x#/definitions/small",
          "#", ""}) {
        expectAll(undecided, std::string(R"({"$ref":")") + reference + "\"}", {"1", "100"});
    }
    expectAll(undecided, R"({"$ref":5})", {"1"});
    EXPECT_EQ(verdictOn(R"({"properties":{"v":{"$ref":"#/definitions/small"}}})", R"({"v":1})"),
              undecided);
}

TEST(SchemaPrecheck, LeavesSchemasWithOtherKeywordsUndecided) {
    for (const char* keyword :
         {R"("allOf":[{}])", R"("anyOf":[{}])", R"("multipleOf":2)", R"("exclusiveMinimum":true)",
          R"("maxItems":5)", R"("uniqueItems":true)", R"("minLength":1)", R"("dependencies":{})",
          R"("patternProperties":{})", R"("format":"date")", R"("TYPE":"null")"}) {
        expectAll(undecided, std::string(R"({"type":"integer",)") + keyword + "}", {"1", "\"\""});
    }
    expectAll(valid, R"({"title":"t","oneOfErrorDescription":"d","$schema":"s","definitions":{}})",
              {"1"});
}

TEST(SchemaPrecheck, LeavesSchemasThatRepeatAKeywordUndecided) {
    expectAll(undecided, R"({"minimum":5,"minimum":0})", {"1", "9"});
}

TEST(SchemaPrecheck, LeavesSchemasUndecidedThatAreNoObjects) {
    expectAll(undecided, "true", {"1"});
    expectAll(undecided, "[]", {"1"});
    EXPECT_EQ(verdictOn("{}", "[]"), valid);
}

// The library gets a null for a container at this depth, so it refuses an array in place of one.
TEST(SchemaPrecheck, LeavesContainersUndecidedThatTheLibraryDoesNotSee) {
    const std::string any = R"({"items":{"items":{}}})";
    expectAll(undecided, any, {"[[[]]]", "[[{}]]"});
    expectAll(valid, any, {"[[1]]", "[[null]]", "[[]]"});
    expectAll(undecided, R"({"items":{"items":{"type":"array"}}})", {"[[[]]]"});
    expectAll(invalid, R"({"items":{"items":{"type":"array"}}})", {"[[null]]"});
}

TEST(SchemaPrecheck, EndsTheRecursionOfASchema) {
    const std::string tree = R"({"$ref":"#/definitions/tree"})";
    expectAll(valid, tree, {"{}", R"({"child":{}})"});
    expectAll(invalid, tree, {"1", R"({"child":1})", R"({"child":{"child":1}})"});
    expectAll(undecided, tree, {R"({"child":{"child":{}}})", R"({"child":{"child":{"child":1}}})"});
}

TEST(SchemaPrecheck, AllocatesNothing) {
    JsonDocument schema;
    schema.Parse(R"({"properties":{"v":{"oneOf":[{"type":"string"},{"type":"array","minItems":1,)"
                 R"("items":{"minimum":0,"enum":[1]}}]}},"required":["v"]})");
    JsonDocument request;
    parseRequestText(R"({"v":[1,1,1]})", request);
    const SchemaPrecheck precheck(schema);
    AllocationFault fault(0, AllocationFault::Extent::AllFromThere);
    EXPECT_EQ(precheck.verdictOn(request), valid);
    EXPECT_FALSE(fault.hasStruck());
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
