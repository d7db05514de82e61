#include <gtest/gtest.h>

#include <string>

#include "StatusTexts.h"
#include "qierr/Writer.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"
#include "support/TestRoot.h"

namespace {

using namespace qixlator::json1;
using statusTexts::usage;

// A status as a driver makes it: with entries of every kind, and with causes of both translators.
const std::string entries = usage("kUsageTypeName", "\"a \\\"name\\\"\"", "\"string\"") + "," +
                            usage("kUsageTypeReservedBySessions", "[\"a\",\"b\"]", "\"string\"") +
                            ",{\"type\":\"elaboration\",\"usage\":\"kAuxTermAvailableAreas\"},"
                            "{\"type\":\"header\",\"usage\":\"kUsageTypeDevice\"}," +
                            usage("x", "[3,4]", "{\"type\":\"enum\",\"id\":9}") + "," +
                            usage("kUsageTypeAttributeId", "4660", "\"uint32_t\"") +
                            ",{\"type\":\"comment\",\"comment\":\"secret\"},{\"type\":\"empty\"}," +
                            usage("kUsageTypeLineNumber", "7", "\"uint32_t\"") + "," +
                            usage("kUsageTypeDevice", "[]", "\"string\"");

const std::string json =
    "{\"file\":\"f.cpp\",\"line\":12,\"component\":\"driver\",\"translator\":\"mxlator_qitrmc\","
    "\"translator_info\":{\"ordered_data\":[" +
    entries +
    "]},\"nested_error\":[{\"code\":-2,\"translator\":\"mxlator_qitrmc\",\"translator_info\":{"
    "\"ordered_data\":[{\"type\":\"elaboration\",\"usage\":\"kAuxTermAvailableAreas\"}," +
    usage("kUsageTypeName", "\"n\"", "\"string\"") +
    "]},\"nested_error\":{\"code\":-1,\"file\":\"g.cpp\"}},"
    "{\"code\":-3,\"translator\":\"mxlator_qitrmc\"}]}";

class LayoutTest : public testing::Test {
  protected:
    LayoutTest() {
        root.write("/usr/local/qinstal/share/errors/English/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nOuter.\n"
                   "</qierror>\n<qierror code=\"-2\">\nInner one.\nInner two.\n</qierror>\n"
                   "</qidocument>\n");
        qierr_Status_setCode(&source, -1);
        qierr_Status_setJson(&source, json.c_str());
    }

    std::string layOut(decltype(&translateErrStatusToRawText) function, std::uint32_t flags) {
        qierr::Status failure;
        qihtl::String text;
        qixlator::Session* session = qixlator_createSession(&failure);
        function(session, &source, 0x200, flags, &text, &failure);
        qixlator_destroySession(session);
        EXPECT_EQ(failure.code, 0) << failure.json;
        return text.c_str();
    }

    TestRoot root;
    qierr::Status source;
};

TEST_F(LayoutTest, TheRawTextOfADriversStatus) {
    EXPECT_EQ(
        layOut(translateErrStatusToRawText, 11),
        "Outer.\n\nName: a \"name\"\n"
        "Reserved by Sessions: a, bThe following NVMEM areas are available:\n"
        "Device\nx: 3, 4\nAttribute ID: 0x00001234\n\nLine Number: 7\nDevice: \n\n"
        "   Inner one.\n   Inner two.\n   The following NVMEM areas are available:\n   Name: n\n\n"
        "      Outer.\n\n"
        "   Error description not found");
}

TEST_F(LayoutTest, TheFormattedTextOfADriversStatus) {
    EXPECT_EQ(layOut(translateErrStatusToFormattedText, 11),
              "Outer.\n\n<B>Name: </B>a \"name\"\n<B>Reserved by Sessions: </B>a, b\n"
              "<B>The following NVMEM areas are available:</B>\n"
              "Device\n<B>x: </B>3, 4\n<B>Attribute ID: </B>0x00001234\n\n"
              "<B>Line Number: </B>7\n<B>Device: </B>\n\n"
              "   Inner one.\n   Inner two.\n   \n"
              "   <B>The following NVMEM areas are available:</B>\n   <B>Name: </B>n\n\n"
              "      Outer.\n\n"
              "   Error description not found");
}

// The rest of the status is compared elsewhere, because the order of its members is not fixed.
TEST_F(LayoutTest, TheDebugSectionFollowsTheItemsInBothForms) {
    qierr_Status_setJson(&source,
                         "{\"file\":\"f.cpp\",\"line\":12,\"component\":\"driver\","
                         "\"translator\":\"mxlator_qitrmc\"}");
    EXPECT_EQ(layOut(translateErrStatusToRawText, 15),
              "Outer.\n\n\nComponent: driver\nFile: f.cpp\nLine: 12\n"
              "rest_of_input_json: {\"translator\":\"mxlator_qitrmc\"}");
    EXPECT_EQ(layOut(translateErrStatusToFormattedText, 15),
              "Outer.\n\n\n<B>Component: </B>driver\n<B>File: </B>f.cpp\n<B>Line: </B>12\n"
              "<B>rest_of_input_json: </B>{\"translator\":\"mxlator_qitrmc\"}");
}

}  // namespace
