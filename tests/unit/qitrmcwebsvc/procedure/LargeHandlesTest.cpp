// Handles with the top bit set, as a driver may return that counts from there or returns addresses.
// Signed types of 32 bits, and types of 64 bits in between, would change them.

#include <algorithm>

#include "support/ProcedureFixture.h"

namespace {

class LargeHandlesTest : public ProcedureFixture,
                         public testing::WithParamInterface<std::uint32_t> {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        give("getPropertyPropertyInt32(" + handle + ", \"Prop.DataType\")", std::int64_t{3});
        give("openGenericProperty", std::uint64_t{GetParam()});
        give("openGenericCommand", std::uint64_t{GetParam()});
    }

    // The recorded calls of functions whose names begin like this.
    Texts callsOf(const std::string& begin) const {
        Texts calls = driver.calls();
        calls.erase(std::remove_if(calls.begin(), calls.end(),
                                   [&](const std::string& call) { return call.find(begin) != 0; }),
                    calls.end());
        return calls;
    }

    const std::string handle = std::to_string(GetParam());
};

TEST_P(LargeHandlesTest, OfASessionArePassedToEveryCallOfTheSession) {
    give("initializeSessionWithoutResources", std::uint64_t{GetParam()});
    give("getSystemPropertyStringArray", Texts{"Mod1"});
    // The number in the id of the session is that of the handle with its sign extended.
    const std::string id =
        "\"session_id\":\"_session" + std::to_string((UINT64_MAX << 32) | GetParam()) + "\"";
    EXPECT_EQ(request("initializeSession", "{}"), "{" + id + "}");
    driver.takeCalls();

    EXPECT_EQ(request("readRegister", "{" + id + R"(,"device":"Mod1","address":4,"size":8})"),
              R"({"next_address":5,"data":0})");
    EXPECT_EQ(request("connectToDevices", "{" + id + R"(,"devices":"Mod1"})"), "{}");
    EXPECT_EQ(request("abortSession", "{" + id + "}"), "{}");
    EXPECT_EQ(request("closeSession", "{" + id + "}"), "{}");
    const Texts readNames = callsOf("getSystemPropertyStringArray(");
    ASSERT_FALSE(readNames.empty());
    EXPECT_EQ(readNames.front(), "getSystemPropertyStringArray(" + handle + ", \"Sys.Devices\")");
    EXPECT_EQ(callsOf("readRegister"), Texts{"readRegisterUInt8(" + handle + ", \"Mod1\", 4)"});
    EXPECT_EQ(callsOf("connectToDevices"), Texts{"connectToDevices(" + handle + ", \"Mod1\", -1)"});
    EXPECT_EQ(callsOf("abortSession"), Texts{"abortSession(" + handle + ")"});
    EXPECT_EQ(callsOf("closeSession"), Texts{"closeSession(" + handle + ")"});
}

TEST_P(LargeHandlesTest, OfAPropertyArePassedToItsReadsAndClosed) {
    openSession();
    give("getPropertyPropertyInt32(" + handle + ", \"Prop.Access\")", std::int64_t{3});
    give("getPropertyPropertyString(" + handle + ", \"Prop.Unit\")", std::string("dB"));
    give("translateStaticEnumValueToString(\"PropertyAccess\", 3)", std::string("ReadWrite"));
    EXPECT_EQ(ask("getPropertyInformation", R"("property":"Dev.Own","device":"Mod1")"),
              R"({"unit":"dB","data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false})");
    EXPECT_EQ(callsOf("closeProperty"), Texts{"closeProperty(" + handle + ")"});
}

TEST_P(LargeHandlesTest, OfACommandArePassedToItsReadsAndClosed) {
    openSession();
    give("getCommandPropertyString(" + handle + ", \"Cmd.Descr\")", std::string("d"));
    give("getCommandPropertyString(" + handle + ", \"Cmd.Doc\")", std::string("Zeroes."));
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Zero","device":"Mod1")"),
              R"({"description":"d","document":"Zeroes."})");
    EXPECT_EQ(callsOf("closeCommand"), Texts{"closeCommand(" + handle + ")"});
}

INSTANTIATE_TEST_SUITE_P(TopBit, LargeHandlesTest,
                         testing::Values(0x80000000u, 0x80000001u, 0xFFFFFFFFu),
                         testing::PrintToStringParamName());

}  // namespace
