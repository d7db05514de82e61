#include <cstdlib>

#include "Driver.h"
#include "qitrmcsim.h"

using namespace drivertest;

namespace {

qitrmcsim_Outstanding outstanding() {
    qitrmcsim_Outstanding counts;
    qitrmcsim_countOutstanding(&counts);
    return counts;
}

char* lentText(const Session& session) {
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getGenericPropertyString(session, "Mod1", "Dev.ProductName", &text, &status);
    EXPECT_EQ(status.code, 0);
    return text;
}

TEST(Outstanding, CountsEachTextUntilItIsFreed) {
    const Session session;
    const std::uint32_t before = outstanding().texts;
    char* first = lentText(session);
    char* second = lentText(session);
    EXPECT_EQ(outstanding().texts, before + 2);
    nQITRMCAPI100_freeString(first);
    EXPECT_EQ(outstanding().texts, before + 1);
    nQITRMCAPI100_freeString(second);
    EXPECT_EQ(outstanding().texts, before);
}

TEST(Outstanding, CountsAnArrayOfTextsAsOneThing) {
    Session session;
    Status status;
    char** array = nullptr;
    std::uint32_t count = 0;
    const auto before = outstanding();
    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &array, &count, &status);
    EXPECT_EQ(outstanding().textArrays, before.textArrays + 1);
    EXPECT_EQ(outstanding().texts, before.texts);
    nQITRMCAPI100_freeStringArray(array, count);
    EXPECT_EQ(outstanding().textArrays, before.textArrays);
}

TEST(Outstanding, CountsArraysOfNumbersAndNotThoseOfTheCaller) {
    const Session session;
    Status status;
    double* array = nullptr;
    std::uint32_t count = 0;
    const std::uint32_t before = outstanding().numberArrays;
    nQITRMCAPI100_getGenericPropertyDoubleArray(session, "Mod1", "DMM.Readings", &array, &count,
                                                &status);
    EXPECT_EQ(outstanding().numberArrays, before + 1);
    nQITRMCAPI100_freeArray(std::malloc(8));
    EXPECT_EQ(outstanding().numberArrays, before + 1);
    nQITRMCAPI100_freeArray(array);
    EXPECT_EQ(outstanding().numberArrays, before);
}

TEST(Outstanding, CountsSessionsAndWhatTheyHaveOpen) {
    const auto before = outstanding();
    {
        const Session session("Mod1");
        Status status;
        nQITRMCAPI100_Property property = 0;
        nQITRMCAPI100_Command command = 0;
        nQITRMCAPI100_openGenericProperty(session, "Mod1", "DMM.Range", &property, &status);
        nQITRMCAPI100_openGenericCommand(session, "Mod1", "DMM.Trigger", &command, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        EXPECT_EQ(outstanding().sessions, before.sessions + 1);
        EXPECT_EQ(outstanding().openProperties, before.openProperties + 1);
        EXPECT_EQ(outstanding().openCommands, before.openCommands + 1);
        nQITRMCAPI100_closeProperty(property, &status);
        EXPECT_EQ(outstanding().openProperties, before.openProperties);
    }
    EXPECT_EQ(outstanding().sessions, before.sessions);
    EXPECT_EQ(outstanding().openCommands, before.openCommands);
}

TEST(Outstanding, AFailedCallLendsNothing) {
    const Session session;
    Status status;
    char* text = nullptr;
    const std::uint32_t before = outstanding().texts;
    nQITRMCAPI100_getGenericPropertyString(session, "Mod1", "No.Such", &text, &status);
    EXPECT_LT(status.code, 0);
    EXPECT_EQ(outstanding().texts, before);
}

TEST(GivingBack, FreeingATextTwiceIsReportedAndHarmless) {
    const Session session;
    char* text = lentText(session);
    nQITRMCAPI100_freeString(text);
    testing::internal::CaptureStderr();
    nQITRMCAPI100_freeString(text);
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "qitrmcapi: nQITRMCAPI100_freeString was given what is not a text that is lent; it "
              "was left alone. Give each thing back once, through the function of its kind.\n");
}

TEST(GivingBack, FreeingThroughTheWrongFunctionIsReportedAndHasNoEffect) {
    const Session session;
    char* text = lentText(session);
    const auto before = outstanding();
    testing::internal::CaptureStderr();
    nQITRMCAPI100_freeArray(text);
    nQITRMCAPI100_freeStringArray(reinterpret_cast<char**>(text), 1);
    const std::string said = testing::internal::GetCapturedStderr();
    EXPECT_NE(said.find("freeArray was given what is not an array of numbers"), std::string::npos);
    EXPECT_NE(said.find("freeStringArray was given what is not an array of texts"),
              std::string::npos);
    EXPECT_EQ(outstanding().texts, before.texts);
    nQITRMCAPI100_freeString(text);
    EXPECT_EQ(outstanding().texts, before.texts - 1);
}

TEST(Start, WritesASummaryOfTheChassisAndUsesNoSessionNumber) {
    Handle first = 0;
    {
        const Session session;
        first = session;
    }
    char* text = nullptr;
    ASSERT_EQ(qitrmcsim_start(&text), 0);
    const std::string summary(text);
    nQITRMCAPI100_freeString(text);
    EXPECT_EQ(summary.substr(0, summary.find('\n', summary.find('\n') + 1)),
              "  Bench  Five-slot chassis, serial number 0C5000AA, 192.0.2.10\n"
              "    slot  1  Mod1   Multimeter, serial number 0C5110B1, ch0:3, NVMEM user (256 "
              "bytes) and calibration (1024 bytes)");
    EXPECT_NE(summary.find("\n    slot  5  Mod5   Switch matrix"), std::string::npos);
    const Session next;
    EXPECT_EQ(next.handle, first + 1);
}

}  // namespace
