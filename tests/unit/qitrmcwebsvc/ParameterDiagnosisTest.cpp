#include "qitrmcwebsvc/ParameterDiagnosis.h"

#include <gtest/gtest.h>

#include <string>

#include "requests.h"

namespace nQITRMCWEBSVC100 {
namespace {

std::string described(const char* schemaText, const SchemaFailure& failure) {
    JsonDocument schema;
    schema.Parse(schemaText);
    return describeFailure(schema, failure);
}

std::optional<Refusal> refusalOfDescription(const char* schemaText, const SchemaFailure& failure) {
    return refusalOf([&] { described(schemaText, failure); });
}

TEST(ParameterDiagnosis, HasNoSentenceForAPointerToNothing) {
    EXPECT_EQ("", described(R"({"type":"string"})", {"#", "#/absent", "type"}));
    EXPECT_EQ("", described(R"({"type":"string"})", {"#", "#/type/absent", "type"}));
    EXPECT_EQ("", described(R"({"type":"string"})", {"#", "#bad pointer", "type"}));
}

TEST(ParameterDiagnosis, HasNoSentenceForAKeywordThatTheSchemaLacks) {
    EXPECT_EQ("", described(R"({"type":"string"})", {"#", "#", "enum"}));
}

TEST(ParameterDiagnosis, HasNoSentenceForNoKeyword) {
    const char* schema = R"({"type":"string","ErrorDescription":"EmptyArray"})";
    EXPECT_EQ("", described(schema, {"#", "#", ""}));
}

TEST(ParameterDiagnosis, HasNoSentenceForAKeywordItDoesNotKnow) {
    EXPECT_EQ("", described(R"({"maxItems":1})", {"#", "#", "maxItems"}));
}

TEST(ParameterDiagnosis, PrefersTheSentenceThatTheSchemaNames) {
    EXPECT_EQ(
        "The parameter must not be empty array.",
        described(R"({"type":"string","typeErrorDescription":"EmptyArray"})", {"#", "#", "type"}));
}

TEST(ParameterDiagnosis, DoesNotFillInASentenceThatTheSchemaNames) {
    EXPECT_EQ("Wrong parameter data type. The data type must be %s.",
              described(R"({"maxItems":1,"maxItemsErrorDescription":"WrongParameterType"})",
                        {"#", "#", "maxItems"}));
}

TEST(ParameterDiagnosis, IgnoresADescriptionNameThatIsNotAString) {
    EXPECT_EQ("Wrong parameter data type. The data type must be string.",
              described(R"({"type":"string","typeErrorDescription":5})", {"#", "#", "type"}));
}

TEST(ParameterDiagnosis, FollowsAnEscapedPointer) {
    EXPECT_EQ("The number must be greater than or equal to -1.5",
              described(R"({"a/b ~":{"minimum":-1.5}})", {"#", "#/a~1b%20~0", "minimum"}));
}

TEST(ParameterDiagnosis, WritesNegativeEnumItems) {
    EXPECT_EQ("Wrong enum item. The enum item must be one of the following items: -5, %d",
              described(R"({"enum":[-5,"%d"]})", {"#", "#", "enum"}));
}

TEST(ParameterDiagnosis, FindsFaultWithAListThatIsNone) {
    const Refusal fault = internalFault("Invalid schema format.");
    EXPECT_EQ(fault, refusalOfDescription(R"({"required":"a"})", {"#", "#", "required"}));
    EXPECT_EQ(fault, refusalOfDescription(R"({"required":["a",1]})", {"#", "#", "required"}));
    EXPECT_EQ(fault, refusalOfDescription(R"({"enum":{"a":1}})", {"#", "#", "enum"}));
}

TEST(ParameterDiagnosis, GivesRawFactsWithAnEmptyKeyword) {
    JsonDocument schema;
    schema.Parse("{}");
    EXPECT_EQ((Refusal{-32602, "[" + usage("kUsageTypeJsonDocPointer", "#/a") + "," +
                                   usage("kUsageTypeJsonSchemaKeyword", "") + "," +
                                   usage("kUsageTypeJsonSchemaPointer", "#") + "]"}),
              refusalOf([&] {
                  throwInvalidParams(schema, {"#/a", "#", ""});
              }));
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
