// What the simulator tells those who watch it.

#include <rapidjson/document.h>

#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

std::string textFrom(std::int32_t (*function)(char**)) {
    char* json = nullptr;
    EXPECT_EQ(function(&json), 0);
    const std::string text = json != nullptr ? json : "";
    nQITRMCAPI100_freeString(json);
    return text;
}

rapidjson::Document traceFrom(std::uint64_t number) {
    char* json = nullptr;
    EXPECT_EQ(qitrmcsim_readTrace(number, &json), 0);
    rapidjson::Document trace;
    trace.Parse(json);
    nQITRMCAPI100_freeString(json);
    return trace;
}

class PanelTest : public BenchTest {
  protected:
    static const rapidjson::Value& deviceNamed(const rapidjson::Document& devices,
                                               const char* name) {
        for (const rapidjson::Value& device : devices.GetArray()) {
            if (std::string(device["name"].GetString()) == name) {
                return device;
            }
        }
        static const rapidjson::Value none(rapidjson::kObjectType);
        ADD_FAILURE() << "no " << name;
        return none;
    }
    static std::string stateOf(const char* name) {
        rapidjson::Document devices;
        devices.Parse(textFrom(qitrmcsim_describeDevices).c_str());
        return deviceNamed(devices, name)["state"].GetString();
    }
};

TEST_F(PanelTest, DevicesAreDescribedWithTheirPlacesAndRegisters) {
    rapidjson::Document devices;
    devices.Parse(textFrom(qitrmcsim_describeDevices).c_str());
    ASSERT_EQ(devices.Size(), 5u);
    const rapidjson::Value& module = deviceNamed(devices, "Mod4");
    EXPECT_EQ(module["slot"].GetInt(), 4);
    EXPECT_STREQ(module["chassis"].GetString(), "Bench");
    EXPECT_STREQ(module["product"].GetString(), "Digitizer");
    const rapidjson::Value& registers = module["registers"];
    ASSERT_EQ(registers.Size(), 2u);
    EXPECT_STREQ(registers[0]["name"].GetString(), "Identification");
    EXPECT_STREQ(registers[0]["description"].GetString(),
                 "The name of the module in ASCII, and its product number.");
    EXPECT_EQ(registers[1]["address"].GetInt(), 256);
    EXPECT_EQ(registers[1]["size"].GetInt(), 256);
    EXPECT_FALSE(registers[1].HasMember("description"));
    EXPECT_FALSE(deviceNamed(devices, "Bench").HasMember("slot"));
}

TEST_F(PanelTest, DevicesThatArePulledOrCutOffStayInTheDescription) {
    EXPECT_EQ(stateOf("Mod2"), "present");
    FaultsInForce faults(R"({"events":[{"device":"Mod2","event":"pulled"}]})");
    EXPECT_EQ(stateOf("Mod2"), "pulled");
    faults.replace(R"({"events":[{"device":"Mod2","event":"connection_lost"}]})");
    EXPECT_EQ(stateOf("Mod2"), "connection_lost");
}

TEST_F(PanelTest, FaultsInForceAreReturnedAsTheyWereSet) {
    EXPECT_EQ(textFrom(qitrmcsim_getFaults), "{}");
    const std::string text = R"( {"faults": [{"function": "reset*", "delay": 0}]})";
    const FaultsInForce faults(text);
    EXPECT_EQ(textFrom(qitrmcsim_getFaults), text);
    EXPECT_LT(setFaults("{").code, 0);
    EXPECT_EQ(textFrom(qitrmcsim_getFaults), text);
}

TEST_F(PanelTest, TheTraceIsReadPieceByPiece) {
    const std::uint64_t first = traceFrom(0)["next"].GetUint64();
    Status status;
    double value = 0.0;
    nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1", "DMM.Range", &value, &status);
    const rapidjson::Document trace = traceFrom(first);
    ASSERT_EQ(trace["lines"].Size(), 1u);
    EXPECT_NE(std::string(trace["lines"][0].GetString()).find("property=\"DMM.Range\") -> 0"),
              std::string::npos);
    EXPECT_EQ(trace["next"].GetUint64(), first + 1);
    EXPECT_EQ(traceFrom(first + 1)["lines"].Size(), 0u);
}

TEST_F(PanelTest, ANumberOfAnEarlierProcessShowsTheWholeTrace) {
    traceFrom(0);
    Status status;
    nQITRMCAPI100_abortSession(session, &status);
    EXPECT_GE(traceFrom(1000000)["lines"].Size(), 1u);
}

TEST_F(PanelTest, TheTraceKeepsTheLatestLines) {
    const std::uint64_t first = traceFrom(0)["next"].GetUint64();
    for (int i = 0; i < 2001; ++i) {
        Status status;
        nQITRMCAPI100_abortSession(session, &status);
    }
    const rapidjson::Document trace = traceFrom(first);
    EXPECT_EQ(trace["lines"].Size(), 2000u);
    EXPECT_EQ(trace["next"].GetUint64(), first + 2001);
}

TEST_F(PanelTest, CallsAreCounted) {
    const std::uint64_t before = qitrmcsim_countCalls();
    Status status;
    nQITRMCAPI100_abortSession(session, &status);
    nQITRMCAPI100_abortSession(session, &status);
    EXPECT_EQ(qitrmcsim_countCalls(), before + 2);
}

}  // namespace
