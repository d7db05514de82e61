#include "Records.h"

using qierr_test::expectBuffer;
using qierr_test::MeteredStatus;
using qierr_test::textOf;

namespace {

std::string afterComment(const char* text, const char* translator = "T") {
    qierr::Status status;
    qierr_Status_setJson(&status, text);
    addComment(qierr_orderedData(translator, &status), "c");
    return textOf(status);
}

constexpr const char* entry = "{\"type\":\"comment\",\"comment\":\"c\"}";

}  // namespace

TEST(OrderedData, CreatesWhatIsMissing) {
    qierr::Status status;
    qierr_orderedData("mxlator_qitrmc", &status);
    expectBuffer(status, 512,
                 "{\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[]}}");
    const std::string made = std::string("{\"a\":1,\"translator\":\"T\",\"translator_info\":") +
                             "{\"ordered_data\":[" + entry + "]}}";
    EXPECT_EQ(afterComment("{\"a\":1}"), made);
}

TEST(OrderedData, CreatesTheParentsOfTheArrayToo) {
    const std::string made = std::string("{\"translator\":\"T\",\"b\":2,\"translator_info\":") +
                             "{\"ordered_data\":[" + entry + "]}}";
    EXPECT_EQ(afterComment("{\"translator\":\"T\",\"b\":2}"), made);
    EXPECT_EQ(afterComment("{\"translator\":\"T\",\"translator_info\":{\"x\":1},\"b\":2}"),
              std::string("{\"translator\":\"T\",\"translator_info\":{\"x\":1,\"ordered_data\":[") +
                  entry + "]},\"b\":2}");
}

TEST(OrderedData, SecondCallAppendsToTheSameArray) {
    qierr::Status status;
    addUsageUInt32(qierr_orderedData("T", &status), "kUsageTypeOffset", 4294967295u);
    addUsageString(qierr_orderedData("T", &status), "kUsageTypeMethod", "say \"hi\"");
    expectBuffer(status, 512,
                 "{\"translator\":\"T\",\"translator_info\":{\"ordered_data\":["
                 "{\"type\":\"usage\",\"usage\":\"kUsageTypeOffset\",\"value\":4294967295,"
                 "\"value_type\":\"uint32_t\"},"
                 "{\"type\":\"usage\",\"usage\":\"kUsageTypeMethod\",\"value\":\"say \\\"hi\\\"\","
                 "\"value_type\":\"string\"}]}}");
}

TEST(OrderedData, BelongsToOneTranslator) {
    const char* text = "{\"translator\":\"other\",\"translator_info\":{\"ordered_data\":[]}}";
    qierr::Status status;
    qierr_Status_setJson(&status, text);
    qierr_Writer writer = qierr_orderedData("T", &status);
    EXPECT_EQ(writer.pos, nullptr);
    writer = addUsageString(writer, "tag", "value");
    writer = addUsageUInt32(writer, "tag", 1);
    writer = addUsageStringArray(writer, "tag", {"value"});
    writer = addComment(writer, "comment");
    EXPECT_EQ(writer.pos, nullptr);
    expectBuffer(status, 512, text);
}

TEST(OrderedData, ComparesTheNameWithItsEscapesResolved) {
    EXPECT_EQ(
        afterComment("{\"translator\":\"\\u0054\",\"translator_info\":{\"ordered_data\":[1]}}"),
        std::string("{\"translator\":\"\\u0054\",\"translator_info\":{\"ordered_data\":[1,") +
            entry + "]}}");
}

TEST(OrderedData, DoesNotChangeTextsOfAnotherStructure) {
    for (const char* text :
         {"[]", "1", "{\"a\"", "{\"translator\":1}", "{\"translator\":\"TT\"}",
          "{\"translator\":\"T\",\"translator_info\":[]}",
          "{\"translator\":\"T\",\"translator_info\":\"x\"}",
          "{\"translator\":\"T\",\"translator_info\":{\"ordered_data\":{}}}",
          "{\"translator\":\"T\",\"translator_info\":{\"ordered_data\":null}}"}) {
        SCOPED_TRACE(text);
        EXPECT_EQ(afterComment(text), text);
    }
}

TEST(OrderedData, FailsWithoutMemory) {
    MeteredStatus status(0);
    status.code = -1;
    EXPECT_EQ(qierr_orderedData("T", &status).pos, nullptr);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.code, -1);
}

TEST(Details, StringArrayIsOneEntry) {
    qierr::Status status;
    const std::vector<std::string> values{"a", "b\n", ""};
    qierr_Writer writer = qierr_orderedData("T", &status);
    writer = addUsageStringArray(writer, "tag", values);
    writer = addUsageStringArray(writer, "none", {});
    EXPECT_EQ(textOf(status),
              "{\"translator\":\"T\",\"translator_info\":{\"ordered_data\":["
              "{\"type\":\"usage\",\"usage\":\"tag\",\"value\":[\"a\",\"b\\n\",\"\"],"
              "\"value_type\":\"string\"},"
              "{\"type\":\"usage\",\"usage\":\"none\",\"value\":[],\"value_type\":\"string\"}]}}");
    EXPECT_STREQ(writer.pos, "]}}");
}

TEST(Details, LargeStringArrayTakesLinearTime) {
    // Twenty megabytes of text exceed any time limit if each element costs a walk over the text.
    qierr::Status status;
    const std::vector<std::string> values(2000000, "element");
    const qierr_Writer writer = addUsageStringArray(qierr_orderedData("T", &status), "tag", values);
    ASSERT_NE(writer.pos, nullptr);
    EXPECT_STREQ(writer.pos, "]}}");
}
