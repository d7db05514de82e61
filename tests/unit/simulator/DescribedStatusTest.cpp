#include "Values.h"

using namespace drivertest;

namespace {

constexpr const char* frame =
    "\"component\":\"qitrmcapi\",\"translator\":\"mxlator_qitrmc\","
    "\"translator_info\":{\"ordered_data\":[";

Outcome failureOf(const char* command) {
    Session session("Unit");
    return execute(session, "Unit", command, 0.0);
}

TEST(DescribedStatusTest, EachKindOfEntryIsWritten) {
    const Outcome outcome = failureOf("Rich");
    EXPECT_EQ(outcome.code, -2147483647 - 1);
    EXPECT_EQ(outcome.text,
              "{\"error_constant\":\"rich \\\"one\\\"\"," + std::string(frame) +
                  usage("Device", "\"Größe\"") +
                  ",{\"type\":\"usage\",\"usage\":\"kUsageTypeRegisterAddress\","
                  "\"value\":4294967295,\"value_type\":\"uint32_t\"}," +
                  usage("Devices", "[\"a\",\"b\"]") + "," + usage("Devices", "[]") +
                  ",{\"type\":\"usage\",\"usage\":\"kUsageTypeRequestedValue\",\"value\":-9,"
                  "\"value_type\":{\"type\":\"enum\",\"id\":4096}}"
                  ",{\"type\":\"elaboration\",\"usage\":\"kAuxTermOperationNotAllowed\"}"
                  ",{\"type\":\"header\",\"usage\":\"kAuxTermUnreachableDevices\"}"
                  ",{\"type\":\"empty\"}]}}");
}

TEST(DescribedStatusTest, CausesAreNestedAndNeedNoConstant) {
    const Outcome outcome = failureOf("Caused");
    EXPECT_EQ(outcome.code, -1);
    const std::string plain = std::string(frame) + "]}";
    EXPECT_EQ(outcome.text,
              "{" + plain + ",\"nested_error\":{\"code\":-2,\"error_constant\":\"why\"," + plain +
                  ",\"nested_error\":[{\"code\":-3," + plain + "},{\"code\":4," + plain + "}]}}");
}

TEST(DescribedStatusTest, ATextOfItsOwnIsReturnedUnchanged) {
    const Outcome outcome = failureOf("Malformed");
    EXPECT_EQ(outcome.code, -9);
    EXPECT_EQ(outcome.text, "{\"translator\": [tr");
}

TEST(DescribedStatusTest, ATextMayBeEmpty) {
    Session session("Unit");
    Status status;
    status.reallocJson(&status, 16);
    nQITRMCAPI100_executeGenericCommand(session, "Unit", "Blank", 0.0, &status);
    EXPECT_EQ(status.code, -9);
    EXPECT_EQ(status.text(), "");
}

}  // namespace
