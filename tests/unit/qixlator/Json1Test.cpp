#include "qixlator/json1.h"

#include <gtest/gtest.h>

#include <string>

#include "TestXlator.h"
#include "qierr/Writer.h"
#include "support/TestRoot.h"

namespace {

using qixlator::json1::translateErrStatusToFormattedText;
using qixlator::json1::translateErrStatusToRawText;

// The attribute word and flag word that the service uses.
constexpr std::uint32_t attributes = 0x200;
constexpr std::uint32_t serviceFlags = 11;

class Json1Test : public testing::Test {
  protected:
    Json1Test() : xlator("test"), session(qixlator_createSession(&failure)) {
        xlator.descriptions[-1] = "Static one";
        xlator.descriptions[-2] = "Static two";
        xlator.descriptions[0] = "Static zero";
    }
    ~Json1Test() override { qixlator_destroySession(session); }

    std::string translate(std::int32_t code, const char* json, std::uint32_t flags,
                          decltype(&translateErrStatusToRawText) function) {
        qierr::Status status;
        qierr_Status_setCode(&status, code);
        if (json != nullptr) {
            qierr_Status_setJson(&status, json);
        }
        qihtl::String text;
        function(session, &status, attributes, flags, &text, &failure);
        return std::string(text.c_str(), text.length());
    }

    std::string raw(std::int32_t code, const char* json, std::uint32_t flags = serviceFlags) {
        return translate(code, json, flags, translateErrStatusToRawText);
    }

    // The raw text of a status of the test's translator with these dynamic items.
    std::string rawItems(const std::string& items) {
        xlator.json1 = "{\"dynamic\":" + items + ",\"debug\":[]}";
        return raw(-1, "{\"translator\":\"test\"}");
    }

    std::string formattedItems(const std::string& items) {
        xlator.json1 = "{\"dynamic\":" + items + "}";
        return translate(-1, "{\"translator\":\"test\"}", serviceFlags,
                         translateErrStatusToFormattedText);
    }

    bool reported(const std::string& part) const {
        return failure.json != nullptr && std::string(failure.json).find(part) != std::string::npos;
    }

    TestRoot root;
    TestXlator xlator;
    qierr::Status failure;
    qixlator::Session* session;
};

// ---- Sections and items -------------------------------------------------------------------------

TEST_F(Json1Test, ASuccessHasNoText) {
    EXPECT_EQ(raw(0, "{\"translator\":\"test\"}"), "");
    EXPECT_TRUE(xlator.calls.empty());
}

TEST_F(Json1Test, NothingIsDoneWhenTheFailureStatusIsNegative) {
    failure.code = -3;
    EXPECT_EQ(raw(-1, "{\"translator\":\"test\"}"), "");
    EXPECT_TRUE(xlator.calls.empty());
}

TEST_F(Json1Test, AnItemFollowsTheDescriptionAfterAnEmptyLine) {
    EXPECT_EQ(rawItems("[{\"type\":\"usage\",\"key\":\"K\",\"value\":\"V\"}]"),
              "Static one\n\nK: V");
    EXPECT_EQ(rawItems("[{\"type\":\"usage\",\"key\":\"K\",\"value\":\"V\"},"
                       "{\"key\":\"L\",\"value\":\"W\"}]"),
              "Static one\n\nK: V\nL: W");
}

TEST_F(Json1Test, TheElementsOfAnArrayAreSeparatedByCommas) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":[\"a\", \"b\"]}]"), "Static one\n\nK: a, b");
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":[\"a\"]}]"), "Static one\n\nK: a");
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":[]}]"), "Static one\n\nK: ");
}

TEST_F(Json1Test, AnElaborationFollowsDirectlyInTheRawForm) {
    EXPECT_EQ(
        rawItems("[{\"key\":\"K\",\"value\":\"V\"},{\"type\":\"elaboration\",\"value\":\"E\"}]"),
        "Static one\n\nK: VE");
}

TEST_F(Json1Test, TheElementsOfARawElaborationHaveNoSeparator) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":\"V\"},"
                       "{\"type\":\"elaboration\",\"value\":[\"c\",\"d\"]}]"),
              "Static one\n\nK: Vcd");
}

TEST_F(Json1Test, TheFormattedFormMarksLabelsAndElaborations) {
    EXPECT_EQ(formattedItems("[{\"key\":\"K\",\"value\":\"V\"},"
                             "{\"type\":\"elaboration\",\"value\":\"E\"}]"),
              "Static one\n\n<B>K: </B>V\n<B>E</B>");
    EXPECT_EQ(formattedItems("[{\"key\":\"K\",\"value\":[\"a\",\"b\"]},"
                             "{\"type\":\"elaboration\",\"value\":[\"c\",\"d\"]}]"),
              "Static one\n\n<B>K: </B>a, b\n<B>c, d</B>");
}

TEST_F(Json1Test, AnItemWithoutKeyOrValueOmitsThatPart) {
    EXPECT_EQ(rawItems("[{\"type\":\"header\",\"value\":\"V\"}]"), "Static one\n\nV");
    EXPECT_EQ(rawItems("[{\"key\":\"K\"}]"), "Static one\n\nK: ");
    EXPECT_EQ(rawItems("[{\"key\":\"\",\"value\":\"V\"}]"), "Static one\n\nV");
    EXPECT_EQ(rawItems("[{\"type\":\"empty\"},{\"value\":\"V\"}]"), "Static one\n\n\nV");
}

TEST_F(Json1Test, EscapesAreResolved) {
    EXPECT_EQ(rawItems("[{\"key\":\"\\\"K\\\"\",\"value\":[\"a\\tb\\u00e9\",\"\\\\\"]}]"),
              "Static one\n\n\"K\": a\tb\xC3\xA9, \\");
}

TEST_F(Json1Test, AFaultyEscapeEndsOnlyItsOwnText) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":[\"a\\ud800z\",\"b\"]}]"),
              "Static one\n\nK: a, b");
    EXPECT_EQ(failure.code, 0);
}

TEST_F(Json1Test, WhatIsNotAnArrayHasNoItems) {
    EXPECT_EQ(rawItems("{}"), "Static one");
    EXPECT_EQ(rawItems("5"), "Static one");
    EXPECT_EQ(failure.code, 0);
}

TEST_F(Json1Test, TheFlagsSelectTheSections) {
    xlator.json1 =
        "{\"dynamic\":[{\"key\":\"K\",\"value\":\"V\"}],"
        "\"debug\":[{\"key\":\"D\",\"value\":\"W\"}]}";
    const char* json = "{\"translator\":\"test\"}";
    EXPECT_EQ(raw(-1, json, 0), "");
    EXPECT_EQ(raw(-1, json, 1), "Static one");
    EXPECT_EQ(raw(-1, json, 2), "K: V");
    EXPECT_EQ(raw(-1, json, 4), "D: W");
    EXPECT_EQ(raw(-1, json, 3), "Static one\n\nK: V");
    EXPECT_EQ(raw(-1, json, 7), "Static one\n\nK: V\n\nD: W");
}

TEST_F(Json1Test, WithoutAFlagForItemsNoneAreRequested) {
    raw(-1, "{\"translator\":\"test\"}", 1);
    EXPECT_EQ(xlator.calls, (std::vector<std::string>{"create test with the registration text",
                                                      "static -1 512"}));
}

TEST_F(Json1Test, TheTextIsAppendedAndLineEndsAreTrimmedOffBothEnds) {
    qierr::Status status;
    qierr_Status_setCode(&status, -1);
    qierr_Status_setJson(&status, "{\"translator\":\"test\"}");
    qihtl::String text;
    text.assign("\r\nbefore ", &failure);
    translateErrStatusToRawText(session, &status, attributes, 1, &text, &failure);
    EXPECT_STREQ(text.c_str(), "before Static one");
}

TEST_F(Json1Test, ANullTextFromTheTranslatorIsNotAFailure) {
    EXPECT_EQ(raw(-99, "{\"translator\":\"test\"}"), "");
    EXPECT_EQ(failure.code, 0);
}

// ---- The translator of a status -----------------------------------------------------------------

TEST_F(Json1Test, AStatusWithoutATranslatorGoesToTheDefaultOne) {
    root.write("/usr/local/qinstal/share/errors/English/a.txt",
               "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nDefault text.\n"
               "</qierror>\n</qidocument>\n");
    EXPECT_EQ(raw(-1, nullptr), "Default text.");
    EXPECT_EQ(raw(-1, "{\"file\":\"x\"}"), "Default text.");
    EXPECT_EQ(raw(-1, "{\"translator\":\"\"}"), "Default text.");
    EXPECT_EQ(raw(-1, "{\"translator\":7}"), "Default text.");
    EXPECT_EQ(raw(-1, "{\"translator\":\"qixlator_default\"}"), "Default text.");
    EXPECT_EQ(failure.code, 0);
}

TEST_F(Json1Test, AFailedDescriptionFailsTheTranslation) {
    EXPECT_EQ(raw(-1, nullptr), "");
    EXPECT_EQ(failure.code, -52006);
}

// ---- Nested errors ------------------------------------------------------------------------------

TEST_F(Json1Test, NestedErrorsAreIndentedByThreeBlanksALevelOnEveryLine) {
    xlator.json1 = "{\"dynamic\":[{\"key\":\"K\",\"value\":\"V\"}]}";
    EXPECT_EQ(raw(-1,
                  "{\"translator\":\"test\",\"nested_error\":{\"code\":-2,\"translator\":\"test\","
                  "\"nested_error\":{\"code\":-1,\"translator\":\"test\"}}}"),
              "Static one\n\nK: V\n\n"
              "   Static two\n   \n   K: V\n\n"
              "      Static one\n      \n      K: V");
}

TEST_F(Json1Test, CarriageReturnsAreTrimmedOffBothEndsOfANestedText) {
    xlator.descriptions[-2] = "\r\n\rStatic two\r\nmore\r\n\r";
    EXPECT_EQ(
        raw(-1,
            "{\"translator\":\"test\",\"nested_error\":[{\"code\":-2,\"translator\":\"test\"},"
            "{\"code\":-1,\"translator\":\"test\"}]}"),
        "Static one\n\n   Static two\r\n   more\n\n   Static one");
}

TEST_F(Json1Test, AnArrayOfNestedErrorsIsTakenInOrder) {
    EXPECT_EQ(raw(-1,
                  "{\"translator\":\"test\",\"nested_error\":[{\"code\":-2,\"translator\":\"test\","
                  "\"nested_error\":[{\"code\":-1,\"translator\":\"test\"}]},"
                  "{\"code\":-1,\"translator\":\"test\"}]}"),
              "Static one\n\n   Static two\n\n      Static one\n\n   Static one");
}

TEST_F(Json1Test, TheTranslatorOfANestedErrorGetsOnlyItsText) {
    const std::string nested = "{\"code\":-2, \"translator\":\"test\", \"x\":[1]}";
    raw(-1, ("{\"translator\":\"test\",\"nested_error\": " + nested + " ,\"y\":2}").c_str());
    EXPECT_EQ(xlator.calls.back(), "dynamic json1 " + nested);
}

TEST_F(Json1Test, OnlyTheNestedFlagShowsNestedErrorsWithTheirItems) {
    xlator.json1 =
        "{\"dynamic\":[{\"key\":\"K\",\"value\":\"V\"}],"
        "\"debug\":[{\"key\":\"D\",\"value\":\"W\"}]}";
    const char* json =
        "{\"translator\":\"test\",\"nested_error\":{\"code\":-2,\"translator\":\"test\"}}";
    EXPECT_EQ(raw(-1, json, 1), "Static one");
    EXPECT_EQ(raw(-1, json, 9), "Static one\n\n   Static two\n   \n   K: V");
    EXPECT_EQ(raw(-1, json, 12), "D: W\n\n   Static two\n   \n   K: V\n   \n   D: W");
}

TEST_F(Json1Test, AnEmptyArrayOfNestedErrorsIsNotAFailure) {
    EXPECT_EQ(raw(-1, "{\"translator\":\"test\",\"nested_error\":[]}"), "Static one");
    EXPECT_EQ(failure.code, 0);
}

TEST_F(Json1Test, ANestedErrorWithoutCodeHasTheTextOfCodeZero) {
    EXPECT_EQ(raw(-1, "{\"translator\":\"test\",\"nested_error\":{\"translator\":\"test\"}}"),
              "Static one\n\n   Static zero");
}

TEST_F(Json1Test, ErrorsMayNestDeeply) {
    std::string json;
    const int depth = 2000;
    for (int level = 0; level < depth; ++level) {
        json += "{\"translator\":\"test\",\"code\":-1,\"nested_error\":";
    }
    json += "{\"translator\":\"test\",\"code\":-2}" + std::string(depth, '}');
    const std::string text = raw(-1, json.c_str(), 9);
    EXPECT_EQ(failure.code, 0);
    const std::string innermost = "\n" + std::string(3 * depth, ' ') + "Static two";
    ASSERT_LT(innermost.size(), text.size());
    EXPECT_EQ(text.substr(text.size() - innermost.size()), innermost);
}

// ---- Failures -----------------------------------------------------------------------------------

TEST_F(Json1Test, AnItemThatIsNotAnObjectIsAFailure) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":\"V\"},[\"x\"]]"), "");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(reported("\"error_constant\":\"qiapalerr_invalidParameter\""));
    EXPECT_TRUE(reported(
        "\"qixlator_debug\":{\"formatDynamicReportItems\":\"json1 dynamic object invalid. each "
        "array item must be an object\",\"json1DynamicObjectBegin\":"
        "\"[{\\\"key\\\":\\\"K\\\",\\\"value\\\":\\\"V\\\"},[\\\"x\\\"]]\"}"))
        << failure.json;
}

TEST_F(Json1Test, AValueThatIsNotAStringIsAFailure) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":5}]"), "");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(reported(
        "\"qixlator_debug\":{\"formatDynamicReportItems\":\"json1 dynamic object invalid. value "
        "can only be string\",\"value type\":3}"))
        << failure.json;
}

TEST_F(Json1Test, AValueThatCannotBeParsedIsAFailure) {
    EXPECT_EQ(rawItems("[{\"key\":\"J\",\"value\":\"U\"},{\"key\":\"K\",\"value\":x}]"), "");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(reported("\"error_constant\":\"qiapalerr_invalidParameter\""));
    EXPECT_TRUE(
        reported("\"qixlator_debug\":{\"formatDynamicReportItems\":\"json1 dynamic object invalid. "
                 "something's wrong with value item\",\"json1DynamicObjectBegin\":"
                 "\"[{\\\"key\\\":\\\"J\\\",\\\"value\\\":\\\"U\\\"},"
                 "{\\\"key\\\":\\\"K\\\",\\\"value\\\":x}],\\\"debug\\\":[]}\","
                 "\"value\":\"x}],\\\"debug\\\":[]}\"}"))
        << failure.json;
}

TEST_F(Json1Test, AnItemWithASyntaxErrorElsewhereIsNotAnObject) {
    for (const char* item : {"{\"key\":\"K\",\"value\":\"V\",5}", "{\"key\":x,\"value\":\"V\"}",
                             "{\"key\" \"K\"}", "{5}", "x"}) {
        failure.code = 0;
        EXPECT_EQ(rawItems(std::string("[") + item + "]"), "") << item;
        EXPECT_EQ(failure.code, -52005) << item;
        EXPECT_TRUE(reported("each array item must be an object")) << failure.json;
    }
}

TEST_F(Json1Test, AnElementThatIsNotAStringIsAFailure) {
    EXPECT_EQ(rawItems("[{\"key\":\"K\",\"value\":[\"a\",null]}]"), "");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(reported("\"value type\":1}")) << failure.json;
}

TEST_F(Json1Test, ANestedErrorOfAnotherTypeIsAFailure) {
    const std::string json = "{\"translator\":\"test\",\"nested_error\":\"x\"}";
    EXPECT_EQ(raw(-1, json.c_str()), "Static one");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(reported(
        "\"qixlator_debug\":{\"translateErrStatusToFormattedText\":\"nested_error contains invalid "
        "json type\",\"json\":\"{\\\"translator\\\":\\\"test\\\",\\\"nested_error\\\":\\\"x\\\"}\","
        "\"jsonz_type\":4}"))
        << failure.json;
}

TEST_F(Json1Test, AnElementOfNestedErrorsOfAnotherTypeIsAFailure) {
    EXPECT_EQ(raw(-1,
                  "{\"translator\":\"test\",\"nested_error\":[{\"translator\":\"test\","
                  "\"code\":-2},true,{\"translator\":\"test\",\"code\":-1}]}"),
              "Static one\n\n   Static two");
    EXPECT_EQ(failure.code, -52005);
    EXPECT_TRUE(
        reported("\"translateErrStatusToFormattedText\":\"nested_error contains invalid "
                 "json type on one of the element\",\"json\":\"{\\\"translator\\\""));
    EXPECT_TRUE(reported(",\"invalid json_type\":2}")) << failure.json;
}

}  // namespace
