#include "qitrmcwebsvc/SchemaValidator.h"

#include <gtest/gtest.h>

#include <string>

#include "embedded/EmbeddedFiles.h"
#include "requests.h"

namespace nQITRMCWEBSVC100 {
namespace {

const std::string session = R"("session_id":"_session1")";

std::optional<Refusal> refusalOfRequest(const std::string& schema, const std::string& text) {
    SchemaValidator validator(embeddedText(("procedure_" + schema + ".json").c_str()));
    const ParsedRequest request(text);
    return refusalOf([&] { validator.validate(*request); });
}

std::optional<Refusal> initializeSession(const std::string& params) {
    return refusalOfRequest("initialize_session", requestText("initializeSession", params));
}

std::optional<Refusal> closeSession(const std::string& params) {
    return refusalOfRequest("close_session", requestText("closeSession", params));
}

std::optional<Refusal> readRegister(const std::string& members) {
    return refusalOfRequest("read_register",
                            requestText("readRegister", "{" + session + "," + members + "}"));
}

std::optional<Refusal> setProperty(const std::string& members) {
    return refusalOfRequest(
        "set_property",
        requestText("setProperty", "{" + session + R"(,"property":"p",)" + members + "}"));
}

std::optional<Refusal> setNvmemBytes(const std::string& data) {
    return refusalOfRequest(
        "set_nvmem_bytes",
        requestText("setNvmemBytes", "{" + session + R"(,"address":0,"data":)" + data + "}"));
}

std::string enumDetails(const std::string& items) {
    return "Wrong enum item. The enum item must be one of the following items: " + items;
}

const std::string unsupported = "This parameter you specified is unsupported.";

// ---- Requests that conform ----------------------------------------------------------------------

TEST(SchemaValidator, AcceptsAConformingRequest) {
    EXPECT_EQ(closeSession("{" + session + "}"), std::nullopt);
    EXPECT_EQ(readRegister(R"("address":4294967295,"size":64)"), std::nullopt);
    EXPECT_EQ(setNvmemBytes("[0,255]"), std::nullopt);
}

TEST(SchemaValidator, AcceptsEmptyParamsForInitializeSession) {
    EXPECT_EQ(initializeSession("{}"), std::nullopt);
}

TEST(SchemaValidator, IgnoresOtherMembersOfTheRequest) {
    EXPECT_EQ(refusalOfRequest("close_session",
                               R"({"x":{"y":[{"z":[[]]}]},"jsonrpc":"2.0","id":"","\u0000":null,)"
                               R"("method":"closeSession","params":{"session_id":"_session0"}})"),
              std::nullopt);
}

TEST(SchemaValidator, AcceptsAnEnumItemInAnyNotation) {
    EXPECT_EQ(readRegister(R"("address":0,"size":8.0)"), std::nullopt);
    EXPECT_EQ(readRegister(R"("address":0,"size":8e0)"), std::nullopt);
    EXPECT_EQ(initializeSession(R"({"access":1.0})"), std::nullopt);
}

// ---- An invalid request -------------------------------------------------------------------------

TEST(SchemaValidator, RefusesParamsThatAreNotAnObjectAsAnInvalidRequest) {
    for (const char* params : {"null", "true", "5", "\"text\"", "[]", "[{}]"}) {
        EXPECT_EQ(closeSession(params), invalidMember("params")) << params;
    }
}

TEST(SchemaValidator, ReadsAbsentParamsAsNull) {
    EXPECT_EQ(refusalOfRequest("close_session",
                               R"({"jsonrpc":"2.0","id":1,"method":"closeSession","Params":{}})"),
              invalidMember("params"));
}

TEST(SchemaValidator, ChecksTheTypeOfParamsFirst) {
    EXPECT_EQ(refusalOfRequest("close_session",
                               R"({"jsonrpc":"2.0","id":1,"method":"other","params":[]})"),
              invalidMember("params"));
}

TEST(SchemaValidator, ChecksASecondParamsMemberAgainstTheSchemaToo) {
    EXPECT_EQ(
        refusalOfRequest("close_session",
                         R"({"jsonrpc":"2.0","id":1,"method":"closeSession","params":{)" + session +
                             R"(},"params":5})"),
        invalidParameter("#/params", "Wrong parameter data type. The data type must be object."));
}

// ---- Each keyword -------------------------------------------------------------------------------

TEST(SchemaValidator, NamesAllRequiredMembersWhenOneIsMissing) {
    EXPECT_EQ(closeSession("{}"),
              invalidParameter("#/params", "The following parameter(s) is required: session_id."));
    EXPECT_EQ(
        readRegister(R"("address":1)"),
        invalidParameter("#/params",
                         "The following parameter(s) is required: session_id, address, size."));
}

TEST(SchemaValidator, RefusesAnUnknownMember) {
    EXPECT_EQ(closeSession("{" + session + R"(,"foo":1})"),
              invalidParameter("#/params/foo", unsupported));
    EXPECT_EQ(closeSession(R"({"foo":[[[]]]})"), invalidParameter("#/params/foo", unsupported));
    EXPECT_EQ(closeSession(R"({"SESSION_ID":"_session1"})"),
              invalidParameter("#/params/SESSION_ID", unsupported));
}

TEST(SchemaValidator, RefusesASessionIdOfAnotherForm) {
    const Refusal expected = invalidParameter(
        "#/params/session_id",
        "Wrong session ID format. The format of a session ID must be _session<number>. For "
        "example, a session ID can be _session1.");
    for (const char* id : {"session1", "_session", "_session1 ", " _session1", "_Session1",
                           "_session-1", "_session1x", ""}) {
        EXPECT_EQ(closeSession(std::string(R"({"session_id":")") + id + "\"}"), expected) << id;
    }
}

TEST(SchemaValidator, ReadsASessionIdUpToItsFirstNul) {
    EXPECT_EQ(closeSession(R"({"session_id":"_session1\u0000x"})"), std::nullopt);
}

TEST(SchemaValidator, ChecksTheTypeBeforeThePattern) {
    for (const char* value : {"5", "null", "true", "[]", "{}"}) {
        EXPECT_EQ(closeSession(std::string(R"({"session_id":)") + value + "}"),
                  invalidParameter("#/params/session_id",
                                   "Wrong parameter data type. The data type must be string."))
            << value;
    }
}

TEST(SchemaValidator, RefusesANumberBelowItsMinimum) {
    EXPECT_EQ(
        refusalOfRequest("get_module_name",
                         requestText("getModuleName", "{" + session + R"(,"slot_number":0})")),
        invalidParameter("#/params/slot_number", "The number must be greater than or equal to 1"));
    EXPECT_EQ(
        refusalOfRequest(
            "execute_command",
            requestText("executeCommand", "{" + session + R"(,"command":"c","timeout":-1})")),
        invalidParameter("#/params/timeout", "The number must be greater than or equal to 0"));
}

TEST(SchemaValidator, RefusesANumberAboveItsMaximum) {
    EXPECT_EQ(readRegister(R"("address":4294967296,"size":8)"),
              invalidParameter("#/params/address",
                               "The number must be less than or equal to 4294967295"));
}

TEST(SchemaValidator, RefusesANumberThatIsNotAnInteger) {
    for (const char* address : {"1.5", "1.0", "1e1", "18446744073709551616"}) {
        EXPECT_EQ(readRegister(std::string(R"("size":8,"address":)") + address),
                  invalidParameter("#/params/address",
                                   "Wrong parameter data type. The data type must be integer."))
            << address;
    }
}

TEST(SchemaValidator, NamesAllItemsOfAnEnumThatAValueIsNotIn) {
    for (const char* size : {"7", "\"8\"", "null", "[8]", "{}", "8.5"}) {
        EXPECT_EQ(readRegister(std::string(R"("address":0,"size":)") + size),
                  invalidParameter("#/params/size", enumDetails("8, 16, 32, 64")))
            << size;
    }
    for (const char* access : {"2", "\"readOnly\"", "\"1\"", "true"}) {
        EXPECT_EQ(initializeSession(std::string(R"({"access":)") + access + "}"),
                  invalidParameter("#/params/access", enumDetails("1, 3, ReadOnly, ReadWrite")))
            << access;
    }
}

TEST(SchemaValidator, RefusesDevicesThatAreNeitherATextNorAnArrayOfTexts) {
    for (const char* devices : {"5", "[\"a\",1]", "null", "{}", "[[\"a\"]]", "[null]"}) {
        EXPECT_EQ(initializeSession(std::string(R"({"devices":)") + devices + "}"),
                  invalidParameter("#/params/devices",
                                   "Wrong data type for parameter devices. The data type must be "
                                   "string or array of string."))
            << devices;
    }
    EXPECT_EQ(initializeSession(R"({"devices":[]})"), std::nullopt);
}

TEST(SchemaValidator, RefusesAPropertyValueThatDoesNotMatchExactlyOneType) {
    // An empty array matches three of the types at once.
    for (const char* value : {"[]", "[1,true]", "null", "{}", "[[1]]", "[null]", "[{}]"}) {
        EXPECT_EQ(setProperty(std::string(R"("value":)") + value),
                  invalidParameter(
                      "#/params/value",
                      "Wrong data type for parameter property. The data type must be one of the "
                      "following data types: boolean, string, number, array of boolean, array of "
                      "string, or array of number."))
            << value;
    }
    for (const char* value : {"true", "1.5", "\"\"", "[true]", "[1,2.5]", "[\"\"]"}) {
        EXPECT_EQ(setProperty(std::string(R"("value":)") + value), std::nullopt) << value;
    }
}

TEST(SchemaValidator, RefusesMembersOfWhichOnlyOneMayBeGiven) {
    EXPECT_EQ(
        refusalOfRequest("commit_properties",
                         requestText("commitProperties",
                                     "{" + session + R"(,"devices":"a","physical_channels":"b"})")),
        invalidParameter("#/params",
                         "You must specify none or only one of the following parameters: "
                         "devices, physical_channels."));
}

TEST(SchemaValidator, ReportsAMissingMemberBeforeAOneOfRule) {
    EXPECT_EQ(refusalOfRequest(
                  "commit_properties",
                  requestText("commitProperties", R"({"devices":"a","physical_channels":"b"})")),
              invalidParameter("#/params", "The following parameter(s) is required: session_id."));
}

TEST(SchemaValidator, RefusesBadBytes) {
    EXPECT_EQ(setNvmemBytes("[]"),
              invalidParameter("#/params/data", "The parameter must not be empty array."));
    EXPECT_EQ(setNvmemBytes("[256]"),
              invalidParameter("#/params/data/0", "The number must be less than or equal to 255"));
    EXPECT_EQ(setNvmemBytes("[0,1,-1,256]"),
              invalidParameter("#/params/data/2", "The number must be greater than or equal to 0"));
    for (const char* element : {"[]", "{}", "null", "1.0", "[[[]]]"}) {
        EXPECT_EQ(setNvmemBytes(std::string("[0,") + element + "]"),
                  invalidParameter("#/params/data/1",
                                   "Wrong parameter data type. The data type must be integer."))
            << element;
    }
}

TEST(SchemaValidator, ReportsOnlyPointersAndKeywordWhereItHasNoSentence) {
    EXPECT_EQ(
        refusalOfRequest("close_session", requestText("abortSession", "{" + session + "}")),
        (Refusal{-32602, "[" + usage("kUsageTypeJsonDocPointer", "#/method") + "," +
                             usage("kUsageTypeJsonSchemaKeyword", "pattern") + "," +
                             usage("kUsageTypeJsonSchemaPointer", "#/properties/method") + "]"}));
}

TEST(SchemaValidator, ReportsTheFirstFailureInTheOrderOfTheRequest) {
    EXPECT_EQ(closeSession(R"({"zzz":1,"session_id":5})"),
              invalidParameter("#/params/zzz", unsupported));
    EXPECT_EQ(closeSession(R"({"session_id":5,"zzz":1})"),
              invalidParameter("#/params/session_id",
                               "Wrong parameter data type. The data type must be string."));
}

// ---- Odd names ----------------------------------------------------------------------------------

TEST(SchemaValidator, WritesOddMemberNamesInUriFragmentForm) {
    EXPECT_EQ(closeSession("{\"a/b \xc3\xa9\":1}"),
              invalidParameter("#/params/a~1b%20%C3%A9", unsupported));
    EXPECT_EQ(closeSession(R"({"~":1})"), invalidParameter("#/params/~0", unsupported));
    EXPECT_EQ(closeSession(R"({"~1":1})"), invalidParameter("#/params/~01", unsupported));
    EXPECT_EQ(closeSession(R"({"":1})"), invalidParameter("#/params/", unsupported));
    EXPECT_EQ(closeSession(R"({"\u0000":1})"), invalidParameter("#/params/%00", unsupported));
    EXPECT_EQ(closeSession(R"({"a\u0000b":1})"), invalidParameter("#/params/a%00b", unsupported));
    EXPECT_EQ(closeSession(R"({"#%\"\\":1})"),
              invalidParameter("#/params/%23%25%22%5C", unsupported));
    EXPECT_EQ(closeSession(R"({"0":1})"), invalidParameter("#/params/0", unsupported));
}

TEST(SchemaValidator, WritesBytesThatAreNotUtf8OneByOne) {
    EXPECT_EQ(closeSession("{\"ab\xff\xfe"
                           "c\":1}"),
              invalidParameter("#/params/ab%FF%FEc", unsupported));
}

TEST(SchemaValidator, DoesNotReadPastANameThatEndsInATruncatedCharacter) {
    for (const std::string broken :
         {"\xc3", "\xe2\x82", "\xe2", "\xf0\x9f\x92", "\xf0\x9f", "\xf0"}) {
        for (std::size_t length = 1; length < 40; ++length) {
            const std::string name = std::string(length, 'n');
            const auto refusal = closeSession("{\"" + name + broken + "\":1}");
            std::string expected = "#/params/" + name;
            for (const char* byte : {"%F0", "%9F", "%92", "%E2", "%82", "%C3"}) {
                if (broken.find(static_cast<char>(std::stoi(byte + 1, nullptr, 16))) !=
                    broken.npos) {
                    expected += byte;
                }
            }
            EXPECT_EQ(refusal, invalidParameter(expected, unsupported));
        }
    }
}

// A text of this length is at the end of a memory block of its own. The pattern stops before the
// truncated character, as it does before a NUL, so the text is left to the session manager.
TEST(SchemaValidator, DoesNotReadPastATextThatEndsInATruncatedCharacter) {
    for (const char* broken : {"\xe2", "\xf0", "\xf0\x9f", "\xf0x"}) {
        for (std::size_t length = 70000; length < 70008; ++length) {
            EXPECT_FALSE(closeSession(R"({"session_id":"_session)" + std::string(length, '1') +
                                      broken + "\"}"));
        }
    }
}

// ---- The validator itself -----------------------------------------------------------------------

TEST(SchemaValidator, StaysUsableAfterAFailure) {
    SchemaValidator validator(embeddedText("procedure_close_session.json"));
    const ParsedRequest bad(requestText("closeSession", R"({"session_id":"x"})"));
    const ParsedRequest good(requestText("closeSession", "{" + session + "}"));
    for (int i = 0; i < 3; ++i) {
        EXPECT_TRUE(refusalOf([&] { validator.validate(*bad); }));
        EXPECT_FALSE(refusalOf([&] { validator.validate(*good); }));
    }
}

TEST(SchemaValidator, RefusesASchemaTextItCannotParse) {
    for (const char* text : {"", "{", "{} {}", "[]", "5"}) {
        EXPECT_EQ(refusalOf([&] { SchemaValidator validator(text); }),
                  internalFault("Fail to parse schema."))
            << text;
    }
}

TEST(SchemaValidator, RefusesDefinitionsItCannotUse) {
    for (const char* text : {"", "{", "[]", "{}", R"({"Definitions":{}})"}) {
        EXPECT_EQ(refusalOf([&] { SchemaValidator validator("{}", text); }),
                  internalFault("Fail to parse definition schema."))
            << text;
    }
}

TEST(SchemaValidator, ReportsTheSchemaBeforeTheDefinitions) {
    EXPECT_EQ(refusalOf([] { SchemaValidator validator("{", "{"); }),
              internalFault("Fail to parse schema."));
}

std::optional<Refusal> refusalByOwnSchema(const std::string& paramsSchema,
                                          const std::string& params) {
    SchemaValidator validator((R"({"properties":{"params":)" + paramsSchema + "}}").c_str(),
                              R"({"definitions":{"small":{"maximum":2.5}}})");
    const ParsedRequest request(requestText("m", params));
    return refusalOf([&] { validator.validate(*request); });
}

TEST(SchemaValidator, JoinsTheSchemaWithTheDefinitions) {
    EXPECT_EQ(
        refusalByOwnSchema(R"({"properties":{"n":{"$ref":"#/definitions/small"}}})", R"({"n":3})"),
        invalidParameter("#/params/n", "The number must be less than or equal to 2.5"));
}

TEST(SchemaValidator, TreatsAnEnumOfOtherTypesAsAFaultOfTheSchema) {
    EXPECT_EQ(refusalByOwnSchema(R"({"properties":{"n":{"enum":[1,2.5]}}})", R"({"n":3})"),
              internalFault("Unsupported data type for enums."));
}

TEST(SchemaValidator, TreatsAnUnknownDescriptionAsAFaultOfTheSchema) {
    EXPECT_EQ(
        refusalByOwnSchema(R"({"properties":{"n":{"maximum":1,"maximumErrorDescription":"None"}}})",
                           R"({"n":3})"),
        internalFault("Fail to get error description"));
}

TEST(SchemaValidator, TreatsTypesThatAreNotOneNameAsAFaultOfTheSchema) {
    EXPECT_EQ(
        refusalByOwnSchema(R"({"properties":{"n":{"type":["string","null"]}}})", R"({"n":3})"),
        internalFault("Invalid schema format."));
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
