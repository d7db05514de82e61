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
    EXPECT_EQ(described(R"({"type":"string"})", {"#", "#/absent", "type"}), "");
    EXPECT_EQ(described(R"({"type":"string"})", {"#", "#/type/absent", "type"}), "");
    EXPECT_EQ(described(R"({"type":"string"})", {"#", "#bad pointer", "type"}), "");
}

TEST(ParameterDiagnosis, HasNoSentenceForAKeywordThatTheSchemaLacks) {
    EXPECT_EQ(described(R"({"type":"string"})", {"#", "#", "enum"}), "");
}

TEST(ParameterDiagnosis, HasNoSentenceForNoKeyword) {
    const char* schema = R"({"type":"string","ErrorDescription":"EmptyArray"})";
    EXPECT_EQ(described(schema, {"#", "#", ""}), "");
}

TEST(ParameterDiagnosis, HasNoSentenceForAKeywordItDoesNotKnow) {
    EXPECT_EQ(described(R"({"maxItems":1})", {"#", "#", "maxItems"}), "");
}

TEST(ParameterDiagnosis, PrefersTheSentenceThatTheSchemaNames) {
    EXPECT_EQ(
        described(R"({"type":"string","typeErrorDescription":"EmptyArray"})", {"#", "#", "type"}),
        "The parameter must not be empty array.");
}

TEST(ParameterDiagnosis, DoesNotFillInASentenceThatTheSchemaNames) {
    EXPECT_EQ(described(R"({"maxItems":1,"maxItemsErrorDescription":"WrongParameterType"})",
                        {"#", "#", "maxItems"}),
              "Wrong parameter data type. The data type must be %s.");
}

TEST(ParameterDiagnosis, IgnoresADescriptionNameThatIsNotAString) {
    EXPECT_EQ(described(R"({"type":"string","typeErrorDescription":5})", {"#", "#", "type"}),
              "Wrong parameter data type. The data type must be string.");
}

TEST(ParameterDiagnosis, FollowsAnEscapedPointer) {
    EXPECT_EQ(described(R"({"a/b ~":{"minimum":-1.5}})", {"#", "#/a~1b%20~0", "minimum"}),
              "The number must be greater than or equal to -1.5");
}

TEST(ParameterDiagnosis, WritesNegativeEnumItems) {
    EXPECT_EQ(described(R"({"enum":[-5,"%d"]})", {"#", "#", "enum"}),
              "Wrong enum item. The enum item must be one of the following items: -5, %d");
}

TEST(ParameterDiagnosis, TreatsAMalformedListAsAFaultOfTheSchema) {
    const Refusal fault = internalFault("Invalid schema format.");
    EXPECT_EQ(refusalOfDescription(R"({"required":"a"})", {"#", "#", "required"}), fault);
    EXPECT_EQ(refusalOfDescription(R"({"required":["a",1]})", {"#", "#", "required"}), fault);
    EXPECT_EQ(refusalOfDescription(R"({"enum":{"a":1}})", {"#", "#", "enum"}), fault);
}

TEST(ParameterDiagnosis, ReportsOnlyPointersForAnEmptyKeyword) {
    JsonDocument schema;
    schema.Parse("{}");
    EXPECT_EQ(refusalOf([&] {
                  throwInvalidParams(schema, {"#/a", "#", ""});
              }),
              (Refusal{-32602, "[" + usage("kUsageTypeJsonDocPointer", "#/a") + "," +
                                   usage("kUsageTypeJsonSchemaKeyword", "") + "," +
                                   usage("kUsageTypeJsonSchemaPointer", "#") + "]"}));
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
