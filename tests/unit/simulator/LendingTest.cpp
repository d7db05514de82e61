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

// The list of all devices, as the driver lends it.
struct DeviceList {
    explicit DeviceList(Handle session) {
        Status status;
        nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &array, &count, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    Names names() const { return Names(array, array + count); }
    void giveBack() const { nQITRMCAPI100_freeStringArray(array, count); }

    char** array = nullptr;
    std::uint32_t count = 0;
};

void rename(Handle session, const char* device, const char* name) {
    Status status;
    nQITRMCAPI100_renameDevice(session, device, name, &status);
    EXPECT_EQ(status.code, 0) << status.text();
}

const Names builtIn{"Bench", "Mod1", "Mod2", "Mod4", "Mod5"};

// A copy for each call would take time in proportion to the devices.
TEST(SharedLists, TheListOfDevicesIsLentToAllCallersWithoutACopy) {
    const Session session;
    const std::uint32_t before = outstanding().textArrays;
    const DeviceList first(session);
    const DeviceList second(session);
    EXPECT_EQ(first.array, second.array);
    EXPECT_EQ(outstanding().textArrays, before + 2);
    first.giveBack();
    EXPECT_EQ(outstanding().textArrays, before + 1);
    EXPECT_EQ(second.names(), builtIn);
    second.giveBack();
    EXPECT_EQ(outstanding().textArrays, before);
    EXPECT_EQ(DeviceList(session).array, first.array);
    first.giveBack();
}

TEST(SharedLists, FreeingOneMoreOftenThanItIsLentIsReportedAndHarmless) {
    const Session session;
    const DeviceList list(session);
    list.giveBack();
    testing::internal::CaptureStderr();
    list.giveBack();
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "qitrmcapi: nQITRMCAPI100_freeStringArray was given what is not an array of texts "
              "that is lent; it was left alone. Give each thing back once, through the function of "
              "its kind.\n");
    const DeviceList next(session);
    EXPECT_EQ(next.names(), builtIn);
    next.giveBack();
}

TEST(SharedLists, FreeingOneThroughTheWrongFunctionHasNoEffect) {
    const Session session;
    const DeviceList list(session);
    const std::uint32_t before = outstanding().textArrays;
    testing::internal::CaptureStderr();
    nQITRMCAPI100_freeArray(list.array);
    nQITRMCAPI100_freeString(reinterpret_cast<char*>(list.array));
    EXPECT_NE(testing::internal::GetCapturedStderr().find("freeArray was given"),
              std::string::npos);
    EXPECT_EQ(outstanding().textArrays, before);
    EXPECT_EQ(list.names(), builtIn);
    list.giveBack();
}

TEST(SharedLists, AListThatIsLentOutlastsAChangeOfTheDevices) {
    const Session session("Mod2");
    const std::uint32_t before = outstanding().textArrays;
    const DeviceList first(session);
    const DeviceList second(session);
    rename(session, "Mod2", "Renamed");
    const DeviceList later(session);
    EXPECT_EQ(later.names(), (Names{"Bench", "Mod1", "Renamed", "Mod4", "Mod5"}));
    EXPECT_EQ(first.names(), builtIn);
    first.giveBack();
    EXPECT_EQ(second.names(), builtIn);
    second.giveBack();
    later.giveBack();
    rename(session, "Renamed", "Mod2");
    const DeviceList last(session);
    EXPECT_EQ(last.names(), builtIn);
    last.giveBack();
    EXPECT_EQ(outstanding().textArrays, before);
}

TEST(SharedLists, TheListsOfPropertiesAreLentWithoutACopy) {
    const Session session;
    for (const char* list :
         {"Sys.SystemProperties", "Sys.SessionProperties", "Sys.DeviceProperties",
          "Sys.PhysChanProperties", "Sys.NVMEMAreaProperties"}) {
        Status status;
        char** arrays[2] = {};
        std::uint32_t counts[2] = {};
        for (int i = 0; i < 2; ++i) {
            nQITRMCAPI100_getSystemPropertyStringArray(session, list, &arrays[i], &counts[i],
                                                       &status);
        }
        EXPECT_EQ(arrays[0], arrays[1]) << list;
        EXPECT_EQ(counts[0], counts[1]) << list;
        EXPECT_GT(counts[0], 0u) << list;
        nQITRMCAPI100_freeStringArray(arrays[0], counts[0]);
        nQITRMCAPI100_freeStringArray(arrays[1], counts[1]);
    }
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
