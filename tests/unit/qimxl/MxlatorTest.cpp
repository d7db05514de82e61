#include <gtest/gtest.h>

#include <string>

#include "StatusTexts.h"
#include "jsonz/jsonz.h"
#include "qierr/Writer.h"
#include "qixlator/Registration.h"
#include "qixlator/exportedXlators.h"
#include "qixlator/json1.h"
#include "qixlator/jsonText.h"
#include "qixlator/qixlator.h"
#include "support/TestRoot.h"

namespace {

using statusTexts::usage;
using statusTexts::withEntries;

// The translator of the service, asked through a session as it is in use.
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

    // The items as they are laid out, one a line: "type: key: value".
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
    EXPECT_STREQ("mxlator_qitrmc", list.next->name);
    EXPECT_STREQ(
        "{\"qixlatorlua_xlator\":\"mxlator\",\"qixlatorlua_settings\":{\"driverName\":\"qitrmc\","
        "\"qiSharedErrorsDir\":\"$_qiShared32Dir/errors\","
        "\"MIErrorsDir\":\"$_qiShared32Dir/mierrors\"}}",
        list.next->registrationInfo);
    EXPECT_STREQ("qixlator_default", list.next->next->name);
    EXPECT_STREQ("{}", list.next->next->registrationInfo);
    EXPECT_EQ(&list, list.next->next->next);
}

TEST_F(MxlatorTest, IsTheOneTranslatorThatIsExported) {
    const qixlator::XlatorRegistration& list = qixlator::exportedRegistrations();
    EXPECT_STREQ("mxlator_qitrmc", list.next->name);
    EXPECT_EQ(nullptr, list.next->registrationInfo);
    EXPECT_EQ(&list, list.next->next);
    XlatorInterface* xlator = qixlator_exported_create(
        "mxlator_qitrmc", qixlator::localRegistrations().next->registrationInfo, &status);
    ASSERT_NE(nullptr, xlator);
    EXPECT_EQ("Error description not found",
              taken(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &status)));
    xlator->destroy(xlator);
}

// ---- Descriptions of codes ----------------------------------------------------------------------

TEST_F(MxlatorTest, ACodeThatIsUnknownEverywhereHasAStandingText) {
    EXPECT_EQ("Error description not found", describe(-250800));
    EXPECT_EQ(0, status.code);
}

TEST_F(MxlatorTest, TheDriversTextComesBeforeTheSharedOne) {
    explain("errors", "Any language.");
    EXPECT_EQ("Error description not found", describe(-250800)) << "no language directory";
    root.makeDirectory("/usr/local/qinstal/share/errors/English");
    EXPECT_EQ("Any language.", describe(-250800));
    explain("errors/English", "Shared.");
    EXPECT_EQ("Shared.", describe(-250800));
    explain("mierrors/qitrmc/English", "Driver.");
    EXPECT_EQ("Driver.", describe(-250800));
    EXPECT_EQ(0, status.code);
}

TEST_F(MxlatorTest, EachPlaceFallsBackToEnglishBeforeTheNext) {
    explain("errors/English", "Shared English.");
    EXPECT_EQ("Shared English.", describe(-250800, 2));
    explain("errors/German", "Shared German.");
    EXPECT_EQ("Shared German.", describe(-250800, 2));
    explain("mierrors/qitrmc/English", "Driver English.");
    EXPECT_EQ("Driver English.", describe(-250800, 2));
    explain("mierrors/qitrmc/German", "Driver German.");
    EXPECT_EQ("Driver German.", describe(-250800, 2));
    EXPECT_EQ("Driver English.", describe(-250800, 0));
}

TEST_F(MxlatorTest, AnUnknownLanguageFallsBackToEnglish) {
    explain("mierrors/qitrmc/Zzzzzzz", "Test language.");
    EXPECT_EQ("Test language.", describe(-250800, 9));
    root.remove("/usr/local/qinstal/share/mierrors");
    explain("mierrors/qitrmc/English", "English.");
    EXPECT_EQ("English.", describe(-250800, 9));
    root.remove("/usr/local/qinstal/share/mierrors");
    explain("errors/English", "Shared English.");
    EXPECT_EQ("Shared English.", describe(-250800, 9));
    EXPECT_EQ(0, status.code);
}

TEST_F(MxlatorTest, ABadFileCountsAsNoText) {
    root.write("/usr/local/qinstal/share/mierrors/qitrmc/English/bad.txt",
               "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"x\">\n");
    explain("errors/English", "Shared.");
    EXPECT_EQ("Shared.", describe(-250800));
    EXPECT_EQ(0, status.code);
}

// ---- Details ------------------------------------------------------------------------------------

TEST_F(MxlatorTest, AUsageShowsTheTermOfItsTagAndItsValue) {
    EXPECT_EQ("usage|Name|n\n", usageItem(usage("kUsageTypeName", "\"n\"", "\"string\"")));
    EXPECT_EQ("usage|Line Number|17\n",
              usageItem(usage("kUsageTypeLineNumber", "17", "\"uint32_t\"")));
    EXPECT_EQ("usage|Line Number|4294967295\n",
              usageItem(usage("kUsageTypeLineNumber", "4294967295", "\"uint32_t\"")));
    EXPECT_EQ("usage|Reserved by Sessions|[\"a\",\"b\"]\n",
              usageItem(usage("kUsageTypeReservedBySessions", "[\"a\",\"b\"]", "\"string\"")));
}

TEST_F(MxlatorTest, ATagWithoutATermIsShownAsItStands) {
    EXPECT_EQ("usage|kUsageTypeNobodyKnows|n\n",
              usageItem(usage("kUsageTypeNobodyKnows", "\"n\"", "\"string\"")));
}

TEST_F(MxlatorTest, TheTermsAreThoseOfTheLanguage) {
    const std::string entry = usage("kUsageTypeName", "\"n\"", "\"string\"");
    EXPECT_EQ("usage|Nom|n\n", usageItem(entry, 1));
    EXPECT_EQ("usage|Name|n\n", usageItem(entry, 9)) << "no dictionary of the test language";
}

TEST_F(MxlatorTest, AnUnknownAttributeIsShownAsItsHexadecimalNumber) {
    for (const char* tag : {"kUsageTypeAttributeId", "kUsageTypeAttributeIdentifier",
                            "kUsageTypeAffectedAttribute", "kUsageTypeConflictingAttr",
                            "kUsageTypeConflictingProperty", "kUsageTypeUnspecifiedProperty"}) {
        const std::string item = usageItem(usage(tag, "4660", "\"uint32_t\""));
        EXPECT_EQ("|0x00001234\n", item.substr(item.rfind('|'))) << tag;
    }
    const std::string items = usageItem(usage("kUsageTypeAttributeId", "[4660,-1]", "\"x\""));
    EXPECT_EQ("|[\"0x00001234\",\"0xFFFFFFFF\"]\n", items.substr(items.rfind('|')));
    const std::string text = usageItem(usage("kUsageTypeAttributeId", "\"name\"", "\"string\""));
    EXPECT_EQ("|name\n", text.substr(text.rfind('|')));
}

TEST_F(MxlatorTest, AnAttributeIdThatIsNoFiniteNumberIsNotShownAs0x8000000000000000) {
    for (const char* id : {"nan", "inf", "-inf", "INFINITY", "nan(7)", "1e999"}) {
        const std::string text =
            usageItem(usage("kUsageTypeAttributeId", "\"" + std::string(id) + "\"", "\"x\""));
        EXPECT_EQ("|" + std::string(id) + "\n", text.substr(text.rfind('|')));
        EXPECT_EQ(
            "usage|x|3\n",
            usageItem(usage("x", "3", "{\"type\":\"enum\",\"id\":\"" + std::string(id) + "\"}")));
    }
    const std::string infinite = usageItem(usage("kUsageTypeAttributeId", "1e999", "\"x\""));
    EXPECT_EQ("|inf\n", infinite.substr(infinite.rfind('|')));
}

TEST_F(MxlatorTest, AWholeNumberIsNotShownWithAnExponent) {
    for (const char* number :
         {"0", "-17", "100000000000000", "123456789012345", "1000000000000000", "9007199254740991",
          "9007199254740992", "-9007199254740991", "-9007199254740992"}) {
        EXPECT_EQ("usage|x|" + std::string(number) + "\n",
                  usageItem(usage("x", number, "\"uint64_t\"")));
    }
    EXPECT_EQ("usage|x|[\"9007199254740991\",\"1\"]\n",
              usageItem(usage("x", "[9007199254740991,1]", "\"uint64_t\"")));
    EXPECT_EQ("usage|x|9007199254740991\n",
              usageItem(usage("x", "9007199254740991", "{\"type\":\"enum\",\"id\":9}")));
}

TEST_F(MxlatorTest, ANumberThatTheDecoderHasRoundedIsShownRounded) {
    EXPECT_EQ("usage|x|1.844674407371e+19\n",
              usageItem(usage("x", "18446744073709551615", "\"uint64_t\"")));
    EXPECT_EQ("usage|x|0.5\n", usageItem(usage("x", "0.5", "\"double\"")));
}

TEST_F(MxlatorTest, AnEnumWithoutANameIsShownAsItsValue) {
    EXPECT_EQ("usage|x|3\n", usageItem(usage("x", "3", "{\"type\":\"enum\",\"id\":9}")));
    EXPECT_EQ("usage|x|[\"3\",\"4\"]\n",
              usageItem(usage("x", "[3,4]", "{\"type\":\"enum\",\"id\":9}")));
}

TEST_F(MxlatorTest, AnUnknownValueTypeShowsNoValue) {
    EXPECT_EQ("usage|x|-\n", usageItem(usage("x", "3", "{\"type\":\"other\"}")));
}

TEST_F(MxlatorTest, OtherValuesAreShownAsTheirJsonText) {
    EXPECT_EQ("usage|x|true\n", usageItem(usage("x", "true", "\"bool\"")));
    EXPECT_EQ("usage|x|null\n", usageItem(usage("x", "null", "\"string\"")));
    EXPECT_EQ("usage|x|[\"[1]\",\"a\"]\n", usageItem(usage("x", "[[1],\"a\"]", "\"string\"")));
}

TEST_F(MxlatorTest, AnEmptyArrayOrNoneShowsNoValue) {
    EXPECT_EQ("usage|Name|-\n", usageItem("{\"type\":\"usage\",\"usage\":\"kUsageTypeName\"}"));
    EXPECT_EQ("usage|x|-\n", usageItem(usage("x", "[]", "\"string\"")));
}

TEST_F(MxlatorTest, OtherKindsOfEntries) {
    EXPECT_EQ("elaboration|-|The following NVMEM areas are available:\nheader|-|Name\nempty|-|-\n",
              usageItem("{\"type\":\"elaboration\",\"usage\":\"kAuxTermAvailableAreas\"},"
                        "{\"type\":\"comment\",\"comment\":\"secret\"},"
                        "{\"type\":\"header\",\"usage\":\"kUsageTypeName\"},{\"type\":\"strange\"},"
                        "{\"type\":\"empty\"},7,null"));
}

TEST_F(MxlatorTest, ACommentIsShownNowhere) {
    const std::string text = json1(withEntries("{\"type\":\"comment\",\"comment\":\"secret\"}"));
    EXPECT_EQ(std::string::npos, text.find("secret")) << text;
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
    EXPECT_EQ(expected, usageItem(entries));
}

TEST_F(MxlatorTest, AStatusWithoutDetailsHasNoItems) {
    EXPECT_EQ("", items("{\"translator\":\"mxlator_qitrmc\"}"));
    EXPECT_EQ("", items("{\"translator\":\"mxlator_qitrmc\",\"translator_info\":{}}"));
    EXPECT_EQ(0, status.code);
}

TEST_F(MxlatorTest, TheDebugItemsTellTheOriginAndTheRest) {
    EXPECT_EQ(
        "usage|Component|qitrmcsvc\nusage|File|f.cpp\nusage|Line|12\n"
        "usage|rest_of_input_json|{\"translator\":\"mxlator_qitrmc\"}\n",
        items("{\"file\":\"f.cpp\",\"line\":12,\"component\":\"qitrmcsvc\","
              "\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[]}}",
              "debug"));
    EXPECT_EQ("usage|rest_of_input_json|{\"translator\":\"mxlator_qitrmc\"}\n",
              items("{\"translator\":\"mxlator_qitrmc\"}", "debug"));
}

TEST_F(MxlatorTest, AnotherFormatIsRefused) {
    EXPECT_EQ("(null)", json1("{\"translator\":\"mxlator_qitrmc\"}", 0x200, "json2"));
    EXPECT_EQ(-52029, status.code);
    EXPECT_NE(std::string::npos, std::string(status.json).find("failed to get dynamic desc"));
}

TEST_F(MxlatorTest, ATextThatIsNoJsonIsAFailure) {
    EXPECT_EQ("(null)", json1("{\"translator\":\"mxlator_qitrmc\",\"broken"));
    EXPECT_EQ(-52003, status.code);
    EXPECT_NE(std::string::npos,
              std::string(status.json)
                  .find("\"qixlatorlua_debug\":{\"debug\":\"failed to get dynamic desc\"}"));
}

TEST_F(MxlatorTest, AnEnvironmentThatIsUnknownIsNoFailure) {
    EXPECT_EQ("usage|Name|n\n", usageItem(usage("kUsageTypeName", "\"n\"", "\"string\""), 0xF00));
    EXPECT_EQ(0, status.code);
}

// ---- The whole road -----------------------------------------------------------------------------

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
    EXPECT_EQ(0, status.code) << status.json;
    EXPECT_STREQ(
        "The device is reserved.\n\nName: device \"1\"\n"
        "Reserved by Sessions: _session1, _session2",
        text.c_str());
}

TEST_F(MxlatorTest, EveryTagOfTheServiceHasAnEnglishTerm) {
    for (const char* tag :
         {"kUsageTypeDetails", "kUsageTypeOffset", "kUsageTypeInvalidMember", "kUsageTypeMethod",
          "kUsageTypeParameter", "kUsageTypeJsonDocPointer", "kUsageTypeJsonSchemaKeyword",
          "kUsageTypeJsonSchemaPointer", "kUsageTypeReservedBySessions", "kUsageTypeSessionId",
          "kUsageTypeRequestedValue", "kUsageTypeDevices", "kUsageTypeRequestedDataType"}) {
        EXPECT_EQ(std::string::npos, usageItem(usage(tag, "\"v\"", "\"string\"")).find(tag)) << tag;
    }
}

}  // namespace
