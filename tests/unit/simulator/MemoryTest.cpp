#include "FaultsInForce.h"
#include "Starvation.h"

using namespace drivertest;

namespace {

// Adds the text that starve() expects, for functions that return only their code.
void putNoDetails(qierr_Status* status) {
    if (status->code != 0) {
        status->reallocJson(status, 4);
        std::memcpy(status->json, "{}", 2);
    }
}

TEST(MemoryTest, OpeningASession) {
    Session warm("Mod1");
    warm.close();
    EXPECT_GT(starve(0,
                     [](qierr_Status* status) {
                         Handle handle = 0;
                         nQITRMCAPI100_initializeSessionWithDevices(&handle, "Mod1,Mod2", 60.0, 3,
                                                                    "a group with a long name", 0.0,
                                                                    status);
                         EXPECT_EQ(handle == 0, status->code != 0);
                         Status closing;
                         nQITRMCAPI100_closeSession(handle, &closing);
                     }),
              0);
    Session next("Mod1,Mod2");
}

TEST(MemoryTest, ARefusal) {
    Session session;
    EXPECT_GT(starve(-250956,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_reserveDevices(session, "a device that is not there", 3, "",
                                                      0.0, status);
                     }),
              0);
}

TEST(MemoryTest, ReadingATextOfSeveralDevices) {
    Session session;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         char** array = nullptr;
                         std::uint32_t count = 0;
                         nQITRMCAPI100_getGenericPropertyStringArray(
                             session, "Mod1,Mod2", "Dev.ProductName", &array, &count, status);
                         nQITRMCAPI100_freeStringArray(array, count);
                     }),
              0);
}

TEST(MemoryTest, MakingTheListOfDevicesAfterAChange) {
    Session session("Mod2");
    const char* names[] = {"Mod2", "Renamed"};
    int current = 0;
    const auto rename = [&] {
        Status status;
        nQITRMCAPI100_renameDevice(session, names[current], names[1 - current], &status);
        EXPECT_EQ(status.code, 0) << status.text();
        current = 1 - current;
    };
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         const long left = allowed.exchange(-1);
                         rename();
                         allowed = left;
                         char** array = nullptr;
                         std::uint32_t count = 0;
                         nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &array,
                                                                    &count, status);
                         EXPECT_EQ(count, status->code == 0 ? 5u : 0u);
                         nQITRMCAPI100_freeStringArray(array, count);
                     }),
              0);
    if (current != 0) {
        rename();
    }
}

TEST(MemoryTest, ListsOfManyDevicesDoNotAccumulateBeforeTheyAreRefused) {
    Session session;
    std::string devices = "Mod1";
    for (int i = 1; i < 1000; ++i) {
        devices += ",Mod1";
    }
    Status status;
    char** array = nullptr;
    std::uint32_t count = 0;
    const long before = liveAllocations;
    mostAllocations = before;
    nQITRMCAPI100_getGenericPropertyStringArray(session, devices.c_str(), "Dev.Properties", &array,
                                                &count, &status);
    EXPECT_EQ(status.code, -250966);
    EXPECT_LT(mostAllocations - before, 100);
}

TEST(MemoryTest, WritingSeveralChannelsWritesAllOrNone) {
    Session session("Mod2");
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         const double values[] = {1.0, 2.0};
                         nQITRMCAPI100_setGenericPropertyDoubleArray(
                             session, "Mod2/ch0:1", "PSU.Voltage", values, 2, status);
                         const bool written = status->code == 0;
                         double first = -1.0;
                         double second = -1.0;
                         allowed = -1;
                         Status reading;
                         nQITRMCAPI100_getGenericPropertyDouble(session, "Mod2/ch0", "PSU.Voltage",
                                                                &first, &reading);
                         nQITRMCAPI100_getGenericPropertyDouble(session, "Mod2/ch1", "PSU.Voltage",
                                                                &second, &reading);
                         EXPECT_EQ(first, written ? 1.0 : 0.0);
                         EXPECT_EQ(second, written ? 2.0 : 0.0);
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod2"), 0);
}

TEST(MemoryTest, ReadingARecord) {
    Session session;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         double* array = nullptr;
                         std::uint32_t count = 0;
                         nQITRMCAPI100_getGenericPropertyDoubleArray(
                             session, "Mod4/ch0", "DIG.Waveform", &array, &count, status);
                         EXPECT_EQ(count, status->code == 0 ? 1024u : 0u);
                         nQITRMCAPI100_freeArray(array);
                     }),
              0);
}

TEST(MemoryTest, ReadingWhatFollowsIsFollowedFurther) {
    Session session;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         double voltage = 0.0;
                         nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1/ch0", "DMM.Voltage",
                                                                &voltage, status);
                     }),
              0);
    // A failed read must not have changed the state: the output is off.
    EXPECT_NEAR(get(getDouble, session, "Mod2/ch0", "PSU.MeasuredVoltage").value, 0.0, 6 * 0.0005);
}

TEST(MemoryTest, SwitchingOnWhatIsFollowed) {
    Session session("Mod2");
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 30.0).code, 0);
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_executeGenericCommand(session, "Mod2/ch0", "PSU.On", 1.0,
                                                             status);
                         const bool on = status->code == 0;
                         allowed = -1;
                         EXPECT_EQ(get(getBool, session, "Mod2/ch0", "PSU.OutputEnabled"),
                                   static_cast<std::uint8_t>(on));
                         const double measured =
                             get(getDouble, session, "Mod2/ch0", "PSU.MeasuredVoltage").value;
                         EXPECT_TRUE(on || measured < 6 * 0.0005) << measured;
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod2"), 0);
}

// Reads a property of a Bench of its own without any failing allocation.
template <typename Number>
Number valueOf(Getter<Number> getter, Handle session, const char* resource, const char* property) {
    allowed = -1;
    return get(getter, session, resource, property).value;
}

TEST(MemoryTest, ARegisterRunsItsCommandOrIsNotWritten) {
    Session session("Mod1");
    std::uint64_t count = 0;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_writeRegisterUInt32(session, "Mod1", 1028, 1, status);
                         count += status->code == 0 ? 1 : 0;
                         EXPECT_EQ(valueOf(getUInt64, session, "Mod1", "DMM.TriggerCount"), count);
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod1"), 0);
}

TEST(MemoryTest, ARegisterWritesItsPropertyOrNothing) {
    Session session("Mod2");
    constexpr std::uint64_t two = 0x4000000000000000;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_writeRegisterUInt64(session, "Mod2", 1032, two, status);
                         EXPECT_EQ(valueOf(getDouble, session, "Mod2/ch1", "PSU.Voltage"),
                                   status->code == 0 ? 2.0 : 0.0);
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod2"), 0);
}

TEST(MemoryTest, ReadingARegisterThatShowsAProperty) {
    Session session("Mod1");
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         std::uint64_t value = 9;
                         nQITRMCAPI100_readRegisterUInt64(session, "Mod1", 1032, &value, status);
                         EXPECT_EQ(value, 0u);
                     }),
              0);
}

TEST(MemoryTest, ACommandActsOnAllChannelsOrNone) {
    Session session("Mod2");
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_executeGenericCommand(session, "Mod2/ch0:1", "PSU.On", 0.0,
                                                             status);
                         const std::uint8_t on = status->code == 0 ? 1 : 0;
                         EXPECT_EQ(valueOf(getBool, session, "Mod2/ch0", "PSU.OutputEnabled"), on);
                         EXPECT_EQ(valueOf(getBool, session, "Mod2/ch1", "PSU.OutputEnabled"), on);
                     }),
              0);
    EXPECT_GT(starve(-250936,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_executeGenericCommand(session, "Mod2/ch0:1", "PSU.Calibrate",
                                                             1.0, status);
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod2"), 0);
}

TEST(MemoryTest, AResettingCommandResetsEverythingOrNothing) {
    Session session("Mod1");
    EXPECT_EQ(set(setDouble, session, "Mod1", "DMM.Range", 1.0).code, 0);
    EXPECT_EQ(set(setText, session, "Mod1", "DMM.Note", "a comment that is long enough").code, 0);
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_executeGenericCommand(session, "Mod1", "DMM.Defaults", 0.0,
                                                             status);
                         EXPECT_EQ(valueOf(getDouble, session, "Mod1", "DMM.Range"),
                                   status->code == 0 ? 10.0 : 1.0);
                         EXPECT_EQ(getText(session, "Mod1", "DMM.Note").value.empty(),
                                   status->code == 0);
                     }),
              0);
}

TEST(MemoryTest, OpeningAProperty) {
    Session session;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_Property handle = 0;
                         nQITRMCAPI100_openGenericProperty(session, "Mod1", "DMM.Range", &handle,
                                                           status);
                         Status closing;
                         nQITRMCAPI100_closeProperty(handle, &closing);
                     }),
              0);
}

TEST(MemoryTest, Renaming) {
    Session session("Mod5");
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_renameDevice(session, "Mod5",
                                                    "a name that is longer than usual", status);
                     }),
              0);
    EXPECT_EQ(session.systemList("Sys.Devices").back(), "a name that is longer than usual");
    Status status;
    nQITRMCAPI100_renameDevice(session, "a name that is longer than usual", "Mod5", &status);
    EXPECT_EQ(status.code, 0) << status.text();
}

TEST(MemoryTest, WritingNvmem) {
    Session session("Mod5");
    const std::uint8_t byte = 1;
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         nQITRMCAPI100_setNvmemBytes(session, "Mod5/user", 0, &byte, 1, "", "",
                                                     status);
                     }),
              0);
    EXPECT_EQ(resetDevices(session, "Mod5"), 0);
}

// Either the requested faults replace the previous ones, or these stay in effect.
TEST(MemoryTest, SettingFaults) {
    Session session;
    const std::string json =
        "{\"faults\":[{\"function\":\"abortSession\",\"resource\":\"Mod1\",\"status\":{"
        "\"code\":-5,\"constant\":\"kConstantOfTheStatus\",\"details\":[{\"header\":\"kA\"}],"
        "\"causes\":[{\"code\":-6}]}},{\"function\":\"abortSession\",\"status\":{\"code\":-78}}],"
        "\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"}]}";
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         status->code = qitrmcsim_setFaults(json.c_str(), nullptr);
                         allowed = -1;
                         EXPECT_EQ(session.abort(), status->code == 0 ? -78 : 0);
                         putNoDetails(status);
                     }),
              0);
    EXPECT_EQ(qitrmcsim_setFaults("{}", nullptr), 0);
}

TEST(MemoryTest, AModuleThatComesBack) {
    Session session;
    const FaultsInForce faults("{\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"}]}");
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         status->code = qitrmcsim_setFaults("{}", nullptr);
                         allowed = -1;
                         EXPECT_EQ(session.systemList("Sys.Devices").size(),
                                   status->code == 0 ? 5u : 4u);
                         putNoDetails(status);
                     }),
              0);
}

TEST(MemoryTest, AFailureByAFault) {
    Session session;
    const FaultsInForce faults(
        oneFault("\"resource\":\"Mod2\",\"moment\":\"after\",\"status\":{\"code\":-77,"
                 "\"json\":\"{}\"}"));
    EXPECT_GT(starve(-77,
                     [&](qierr_Status* status) {
                         char** array = nullptr;
                         std::uint32_t count = 0;
                         nQITRMCAPI100_getGenericPropertyStringArray(
                             session, "Mod1,Mod2", "Dev.ProductName", &array, &count, status);
                         EXPECT_EQ(array, nullptr);
                         EXPECT_EQ(count, 0u);
                     }),
              0);
}

TEST(MemoryTest, OutputsOfAFault) {
    Session session;
    for (const char* output : {"\"count\":5", "\"text_size\":100,\"count\":3"}) {
        const FaultsInForce faults(oneFault("\"output\":{" + std::string(output) + "}"));
        EXPECT_GT(starve(0,
                         [&](qierr_Status* status) {
                             char** array = nullptr;
                             std::uint32_t count = 0;
                             nQITRMCAPI100_getGenericPropertyStringArray(
                                 session, "Mod1", "DMM.Labels", &array, &count, status);
                             EXPECT_EQ(array == nullptr, status->code != 0);
                             nQITRMCAPI100_freeStringArray(array, count);
                         }),
                  0);
        EXPECT_GT(starve(0,
                         [&](qierr_Status* status) {
                             double* array = nullptr;
                             std::uint32_t count = 0;
                             nQITRMCAPI100_getGenericPropertyDoubleArray(
                                 session, "Mod1", "DMM.Readings", &array, &count, status);
                             EXPECT_EQ(array == nullptr, status->code != 0);
                             nQITRMCAPI100_freeArray(array);
                         }),
                  0);
    }
}

TEST(MemoryTest, ADelay) {
    Session session;
    const FaultsInForce faults(oneFault("\"function\":\"readRegister*\",\"delay\":0.001"));
    EXPECT_GT(starve(0,
                     [&](qierr_Status* status) {
                         std::uint8_t value = 0;
                         nQITRMCAPI100_readRegisterUInt8(session, "Mod1", 0, &value, status);
                     }),
              0);
}

TEST(MemoryTest, AnOpeningThatIsToWarnLeavesNothingOpenWhenItFails) {
    FaultsInForce faults("{}");
    EXPECT_GT(starve(77,
                     [&](qierr_Status* status) {
                         const long left = allowed.exchange(-1);
                         faults.replace(
                             oneFault("\"function\":\"initialize*\",\"status\":{"
                                      "\"code\":77,\"json\":\"{}\"}"));
                         allowed = left;
                         Handle handle = 0;
                         nQITRMCAPI100_initializeSessionWithDevices(&handle, "Mod5", 60.0, 3, "",
                                                                    0.0, status);
                         allowed = -1;
                         EXPECT_EQ(handle == 0, status->code < 0);
                         faults.replace("{}");
                         Status closing;
                         nQITRMCAPI100_closeSession(handle, &closing);
                         const Session next("Mod5");
                     }),
              0);
}

}  // namespace
