#include <gtest/gtest.h>

#include <string>

#include "StatusTexts.h"
#include "jsonz/jsonz.h"
#include "qierr/Writer.h"
#include "qixlator/Registration.h"
#include "qixlator/exported.h"
#include "qixlator/json1.h"
#include "qixlator/jsonText.h"
#include "qixlator/qixlator.h"
#include "support/TestRoot.h"

namespace {

using statusTexts::usage;
using statusTexts::withEntries;

// The translator of the service, used through a session as in production.
class MxlatorTest : public testing::Test {
  protected:
    MxlatorTest() : session(qixlator_createSession(&status)) {}
    ~MxlatorTest() override { qixlator_destroySession(session); }

    static std::string taken(char* text) {
        const std::string copy = text == nullptr ? "(null)" : text;
        qixlator_realloc(text, 0, nullptr, nullptr);
        return copy;
    }

    std::string describe(std::int32_t code, std::uint32_t attributes = 0x200) {
        return taken(qixlator_getStaticDesc(session, code, "mxlator_qitrmc", attributes,
                                            qixlator_realloc, nullptr, &status));
    }

    std::string json1(const std::string& json, std::uint32_t attributes = 0x200,
                      const char* format = "json1") {
        return taken(qixlator_getDynamicDesc(session, json.c_str(), attributes, format,
                                             qixlator_realloc, nullptr, &status));
    }

    // The items in the order of the text, one per line: "type: key: value".
    std::string items(const std::string& json, const char* section = "dynamic",
                      std::uint32_t attributes = 0x200) {
        const std::string text = json1(json, attributes);
        std::string lines;
        const char* item = jsonz_firstElement(jsonz_findMember(text.c_str(), section));
        while (item != nullptr) {
            lines += read(jsonz_findMember(item, "type")) + "|" +
                     read(jsonz_findMember(item, "key")) + "|" +
                     read(jsonz_findMember(item, "value")) + "\n";
            item = jsonz_nextElement(jsonz_readValue(item, nullptr));
        }
        return lines;
    }

    // A string, or the text of any other value.
    std::string read(const char* position) {
        if (position == nullptr) {
            return "-";
        }
        jsonz_value value;
        jsonz_readValue(position, &value);
        qihtl::String text;
        if (value.type == jsonz_typeString) {
            qixlator::appendJsonString(position, &text, &status);
        } else {
            qixlator::appendJsonText(position, &text, &status);
        }
        return text.c_str();
    }

    std::string usageItem(const std::string& entry, std::uint32_t attributes = 0x200) {
        return items(withEntries(entry), "dynamic", attributes);
    }

    void explain(const std::string& directory, const std::string& text) {
        root.write("/usr/local/qinstal/share/" + directory + "/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-250800\">\n" + text +
                       "\n</qierror>\n</qidocument>\n");
    }

    TestRoot root;
    qierr::Status status;
    qixlator::Session* session;
};

// ---- Registration -------------------------------------------------------------------------------

TEST_F(MxlatorTest, IsRegisteredBeforeTheDefaultTranslator) {
    const qixlator::XlatorRegistration& list = qixlator::localRegistrations();
    EXPECT_STREQ(list.next->name, "mxlator_qitrmc");
    EXPECT_STREQ(
        list.next->registrationInfo,
        "{\"qixlatorlua_xlator\":\"mxlator\",\"qixlatorlua_settings\":{\"driverName\":\"qitrmc\","
        "\"qiSharedErrorsDir\":\"$_qiShared32Dir/errors\","
        "\"MIErrorsDir\":\"$_qiShared32Dir/mierrors\"}}");
    EXPECT_STREQ(list.next->next->name, "qixlator_default");
    EXPECT_STREQ(list.next->next->registrationInfo, "{}");
    EXPECT_EQ(list.next->next->next, &list);
}

TEST_F(MxlatorTest, IsTheOneTranslatorThatIsExported) {
    const qixlator::XlatorRegistration& list = qixlator::exportedRegistrations();
    EXPECT_STREQ(list.next->name, "mxlator_qitrmc");
    EXPECT_EQ(list.next->registrationInfo, nullptr);
    EXPECT_EQ(list.next->next, &list);
    XlatorInterface* xlator = qixlator_exported_create(
        "mxlator_qitrmc", qixlator::localRegistrations().next->registrationInfo, &status);
    ASSERT_NE(xlator, nullptr);
    EXPECT_EQ(taken(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &status)),
              "Error description not found");
    xlator->destroy(xlator);
}

// ---- Descriptions of codes ----------------------------------------------------------------------

TEST_F(MxlatorTest, AnUnknownCodeHasAFixedText) {
    EXPECT_EQ(describe(-250800), "Error description not found");
    EXPECT_EQ(status.code, 0);
}

TEST_F(MxlatorTest, TheDriversTextComesBeforeTheSharedOne) {
    explain("errors", "Any language.");
    EXPECT_EQ(describe(-250800), "Error description not found") << "no language directory";
    root.makeDirectory("/usr/local/qinstal/share/errors/English");
    EXPECT_EQ(describe(-250800), "Any language.");
    explain("errors/English", "Shared.");
    EXPECT_EQ(describe(-250800), "Shared.");
    explain("mierrors/qitrmc/English", "Driver.");
    EXPECT_EQ(describe(-250800), "Driver.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(MxlatorTest, EachDirectoryFallsBackToEnglishBeforeTheNext) {
    explain("errors/English", "Shared English.");
    EXPECT_EQ(describe(-250800, 2), "Shared English.");
    explain("errors/German", "Shared German.");
    EXPECT_EQ(describe(-250800, 2), "Shared German.");
    explain("mierrors/qitrmc/English", "Driver English.");
    EXPECT_EQ(describe(-250800, 2), "Driver English.");
    explain("mierrors/qitrmc/German", "Driver German.");
    EXPECT_EQ(describe(-250800, 2), "Driver German.");
    EXPECT_EQ(describe(-250800, 0), "Driver English.");
}

TEST_F(MxlatorTest, AnUnknownLanguageFallsBackToEnglish) {
    explain("mierrors/qitrmc/Zzzzzzz", "Test language.");
    EXPECT_EQ(describe(-250800, 9), "Test language.");
    root.remove("/usr/local/qinstal/share/mierrors");
    explain("mierrors/qitrmc/English", "English.");
    EXPECT_EQ(describe(-250800, 9), "English.");
    root.remove("/usr/local/qinstal/share/mierrors");
    explain("errors/English", "Shared English.");
    EXPECT_EQ(describe(-250800, 9), "Shared English.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(MxlatorTest, ABadFileCountsAsNoText) {
    root.write("/usr/local/qinstal/share/mierrors/qitrmc/English/bad.txt",
               "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"x\">\n");
    explain("errors/English", "Shared.");
    EXPECT_EQ(describe(-250800), "Shared.");
    EXPECT_EQ(status.code, 0);
}

// ---- Details ------------------------------------------------------------------------------------

TEST_F(MxlatorTest, AUsageShowsTheTermOfItsTagAndItsValue) {
    EXPECT_EQ(usageItem(usage("kUsageTypeName", "\"n\"", "\"string\"")), "usage|Name|n\n");
    EXPECT_EQ(usageItem(usage("kUsageTypeLineNumber", "17", "\"uint32_t\"")),
              "usage|Line Number|17\n");
    EXPECT_EQ(usageItem(usage("kUsageTypeLineNumber", "4294967295", "\"uint32_t\"")),
              "usage|Line Number|4294967295\n");
    EXPECT_EQ(usageItem(usage("kUsageTypeReservedBySessions", "[\"a\",\"b\"]", "\"string\"")),
              "usage|Reserved by Sessions|[\"a\",\"b\"]\n");
}

TEST_F(MxlatorTest, ATagWithoutATermIsShownUnchanged) {
    EXPECT_EQ(usageItem(usage("kUsageTypeNobodyKnows", "\"n\"", "\"string\"")),
              "usage|kUsageTypeNobodyKnows|n\n");
}

TEST_F(MxlatorTest, TheTermsAreThoseOfTheLanguage) {
    const std::string entry = usage("kUsageTypeName", "\"n\"", "\"string\"");
    EXPECT_EQ(usageItem(entry, 1), "usage|Nom|n\n");
    EXPECT_EQ(usageItem(entry, 9), "usage|Name|n\n") << "no dictionary of the test language";
}

TEST_F(MxlatorTest, AnUnknownAttributeIsShownAsItsHexadecimalNumber) {
    for (const char* tag : {"kUsageTypeAttributeId", "kUsageTypeAttributeIdentifier",
                            "kUsageTypeAffectedAttribute", "kUsageTypeConflictingAttr",
                            "kUsageTypeConflictingProperty", "kUsageTypeUnspecifiedProperty"}) {
        const std::string item = usageItem(usage(tag, "4660", "\"uint32_t\""));
        EXPECT_EQ(item.substr(item.rfind('|')), "|0x00001234\n") << tag;
    }
    const std::string items = usageItem(usage("kUsageTypeAttributeId", "[4660,-1]", "\"x\""));
    EXPECT_EQ(items.substr(items.rfind('|')), "|[\"0x00001234\",\"0xFFFFFFFF\"]\n");
    const std::string text = usageItem(usage("kUsageTypeAttributeId", "\"name\"", "\"string\""));
    EXPECT_EQ(text.substr(text.rfind('|')), "|name\n");
}

TEST_F(MxlatorTest, AnAttributeIdThatIsNoFiniteNumberIsNotShownAs0x8000000000000000) {
    for (const char* id : {"nan", "inf", "-inf", "INFINITY", "nan(7)", "1e999"}) {
        const std::string text =
            usageItem(usage("kUsageTypeAttributeId", "\"" + std::string(id) + "\"", "\"x\""));
        EXPECT_EQ(text.substr(text.rfind('|')), "|" + std::string(id) + "\n");
        EXPECT_EQ(
            usageItem(usage("x", "3", "{\"type\":\"enum\",\"id\":\"" + std::string(id) + "\"}")),
            "usage|x|3\n");
    }
    const std::string infinite = usageItem(usage("kUsageTypeAttributeId", "1e999", "\"x\""));
    EXPECT_EQ(infinite.substr(infinite.rfind('|')), "|inf\n");
}

TEST_F(MxlatorTest, AWholeNumberIsNotShownWithAnExponent) {
    for (const char* number :
         {"0", "-17", "100000000000000", "123456789012345", "1000000000000000", "9007199254740991",
          "9007199254740992", "-9007199254740991", "-9007199254740992"}) {
        EXPECT_EQ(usageItem(usage("x", number, "\"uint64_t\"")),
                  "usage|x|" + std::string(number) + "\n");
    }
    EXPECT_EQ(usageItem(usage("x", "[9007199254740991,1]", "\"uint64_t\"")),
              "usage|x|[\"9007199254740991\",\"1\"]\n");
    EXPECT_EQ(usageItem(usage("x", "9007199254740991", "{\"type\":\"enum\",\"id\":9}")),
              "usage|x|9007199254740991\n");
}

TEST_F(MxlatorTest, ANumberThatTheDecoderHasRoundedIsShownRounded) {
    EXPECT_EQ(usageItem(usage("x", "18446744073709551615", "\"uint64_t\"")),
              "usage|x|1.844674407371e+19\n");
    EXPECT_EQ(usageItem(usage("x", "0.5", "\"double\"")), "usage|x|0.5\n");
}

TEST_F(MxlatorTest, AnEnumWithoutANameIsShownAsItsValue) {
    EXPECT_EQ(usageItem(usage("x", "3", "{\"type\":\"enum\",\"id\":9}")), "usage|x|3\n");
    EXPECT_EQ(usageItem(usage("x", "[3,4]", "{\"type\":\"enum\",\"id\":9}")),
              "usage|x|[\"3\",\"4\"]\n");
}

TEST_F(MxlatorTest, AnUnknownValueTypeShowsNoValue) {
    EXPECT_EQ(usageItem(usage("x", "3", "{\"type\":\"other\"}")), "usage|x|-\n");
}

TEST_F(MxlatorTest, OtherValuesAreShownAsTheirJsonText) {
    EXPECT_EQ(usageItem(usage("x", "true", "\"bool\"")), "usage|x|true\n");
    EXPECT_EQ(usageItem(usage("x", "null", "\"string\"")), "usage|x|null\n");
    EXPECT_EQ(usageItem(usage("x", "[[1],\"a\"]", "\"string\"")), "usage|x|[\"[1]\",\"a\"]\n");
}

TEST_F(MxlatorTest, AnEmptyOrMissingArrayShowsNoValue) {
    EXPECT_EQ(usageItem("{\"type\":\"usage\",\"usage\":\"kUsageTypeName\"}"), "usage|Name|-\n");
    EXPECT_EQ(usageItem(usage("x", "[]", "\"string\"")), "usage|x|-\n");
}

TEST_F(MxlatorTest, EntriesOfOtherKindsAreShown) {
    EXPECT_EQ(usageItem("{\"type\":\"elaboration\",\"usage\":\"kAuxTermAvailableAreas\"},"
                        "{\"type\":\"comment\",\"comment\":\"secret\"},"
                        "{\"type\":\"header\",\"usage\":\"kUsageTypeName\"},{\"type\":\"strange\"},"
                        "{\"type\":\"empty\"},7,null"),
              "elaboration|-|The following NVMEM areas are available:\nheader|-|Name\nempty|-|-\n");
}

TEST_F(MxlatorTest, ACommentIsNeverShown) {
    const std::string text = json1(withEntries("{\"type\":\"comment\",\"comment\":\"secret\"}"));
    EXPECT_EQ(text.find("secret"), std::string::npos) << text;
    EXPECT_NE(std::string::npos, text.find("\"dynamic\":{}")) << text;
}

TEST_F(MxlatorTest, ManyEntriesKeepTheirOrder) {
    std::string entries;
    std::string expected;
    for (int number = 0; number < 100; ++number) {
        const std::string text = std::to_string(number);
        entries += (number == 0 ? "" : ",") + usage("t" + text, "\"v\"", "\"string\"");
        expected += "usage|t" + text + "|v\n";
    }
    EXPECT_EQ(usageItem(entries), expected);
}

TEST_F(MxlatorTest, AStatusWithoutDetailsHasNoItems) {
    EXPECT_EQ(items("{\"translator\":\"mxlator_qitrmc\"}"), "");
    EXPECT_EQ(items("{\"translator\":\"mxlator_qitrmc\",\"translator_info\":{}}"), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(MxlatorTest, TheDebugItemsContainTheOriginAndTheOtherMembers) {
    EXPECT_EQ(items("{\"file\":\"f.cpp\",\"line\":12,\"component\":\"qitrmcsvc\","
                    "\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[]}}",
                    "debug"),
              "usage|Component|qitrmcsvc\nusage|File|f.cpp\nusage|Line|12\n"
              "usage|rest_of_input_json|{\"translator\":\"mxlator_qitrmc\"}\n");
    EXPECT_EQ(items("{\"translator\":\"mxlator_qitrmc\"}", "debug"),
              "usage|rest_of_input_json|{\"translator\":\"mxlator_qitrmc\"}\n");
}

TEST_F(MxlatorTest, AnotherFormatIsRefused) {
    EXPECT_EQ(json1("{\"translator\":\"mxlator_qitrmc\"}", 0x200, "json2"), "(null)");
    EXPECT_EQ(status.code, -52029);
    EXPECT_NE(std::string::npos, std::string(status.json).find("failed to get dynamic desc"));
}

TEST_F(MxlatorTest, ATextThatIsNotJsonIsAFailure) {
    EXPECT_EQ(json1("{\"translator\":\"mxlator_qitrmc\",\"broken"), "(null)");
    EXPECT_EQ(status.code, -52003);
    EXPECT_NE(std::string::npos,
              std::string(status.json)
                  .find("\"qixlatorlua_debug\":{\"debug\":\"failed to get dynamic desc\"}"));
}

TEST_F(MxlatorTest, AnUnknownEnvironmentIsNotAFailure) {
    EXPECT_EQ(usageItem(usage("kUsageTypeName", "\"n\"", "\"string\""), 0xF00), "usage|Name|n\n");
    EXPECT_EQ(status.code, 0);
}

// ---- A whole translation ------------------------------------------------------------------------

TEST_F(MxlatorTest, AStatusOfTheServiceBecomesAText) {
    explain("mierrors/qitrmc/English", "The device is reserved.");
    qierr::Status failure;
    qierr_Status_setCodeAt(&failure, -250800, QITRMC_HERE);
    qierr_Writer writer = qierr_orderedData("mxlator_qitrmc", &failure);
    writer = addUsageString(writer, "kUsageTypeName", "device \"1\"");
    writer = addComment(writer, "for maintainers");
    addUsageStringArray(writer, "kUsageTypeReservedBySessions", {"_session1", "_session2"});
    qihtl::String text;
    qixlator::json1::translateErrStatusToRawText(session, &failure, 0x200, 11, &text, &status);
    EXPECT_EQ(status.code, 0) << status.json;
    EXPECT_STREQ(text.c_str(),
                 "The device is reserved.\n\nName: device \"1\"\n"
                 "Reserved by Sessions: _session1, _session2");
}

TEST_F(MxlatorTest, EveryTagOfTheServiceHasAnEnglishTerm) {
    for (const char* tag :
         {"kUsageTypeDetails", "kUsageTypeOffset", "kUsageTypeInvalidMember", "kUsageTypeMethod",
          "kUsageTypeParameter", "kUsageTypeJsonDocPointer", "kUsageTypeJsonSchemaKeyword",
          "kUsageTypeJsonSchemaPointer", "kUsageTypeReservedBySessions", "kUsageTypeSessionId",
          "kUsageTypeRequestedValue", "kUsageTypeDevices", "kUsageTypeRequestedDataType"}) {
        EXPECT_EQ(usageItem(usage(tag, "\"v\"", "\"string\"")).find(tag), std::string::npos) << tag;
    }
}

}  // namespace
