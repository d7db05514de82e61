#include <algorithm>
#include <tuple>

#include "ServiceTest.h"
#include "qitrmcwebsvc/IProcedureFactory.h"
#include "support/allocationFaults.h"
#include "support/cjsonLeak.h"
#include "support/knownChassis.h"
#include "support/series.h"

namespace {

// A request during which memory fails. In bodies "@" stands for the session opened last.
struct Scenario {
    const char* name;
    std::vector<std::string> before;
    std::string body;
    std::vector<std::int32_t> undisturbed;
};

std::ostream& operator<<(std::ostream& stream, const Scenario& scenario) {
    return stream << scenario.name;
}

std::string call(const std::string& method, const std::string& params) {
    return R"({"jsonrpc":"2.0","id":"the id of a client, beyond a short text","method":")" +
           method + R"(","params":)" + params + "}";
}

const std::string ofSession = R"({"session_id":"_session@"})";
const std::string ofNoSession = R"({"session_id":"_session987654321987654321"})";
const std::string devices = R"("devices":["aDeviceWithALongName,A","anotherDeviceWithALongName"])";

const std::string openPlain = call("initializeSession", "{}");
const std::string openDevices = call("initializeSession", "{" + devices + "}");
const std::string openShared =
    call("initializeSession",
         "{" + devices + R"(,"access":"ReadOnly","reservation_group":"a group with a long name"})");
const std::string openForced = call(
    "initializeSession", "{" + devices + R"(,"force_reserve":true,"reservation_timeout":0.5})");
const std::string openChannels = call(
    "initializeSession", R"({"physical_channels":["A/aChannelWithALongName0:30","B/ch1,B/ch2"]})");

// A method on a session without resources, with further members of params.
Scenario onSession(const char* method, const std::string& members) {
    const std::string separator = members.empty() ? "" : ",";
    return {method,
            {openPlain},
            call(method, R"({"session_id":"_session@")" + separator + members + "}"),
            {0}};
}

const Scenario scenarios[] = {
    {"OpenWithoutResources", {}, openPlain, {0}},
    {"OpenOnDevices", {}, openDevices, {0}},
    {"OpenOnDevicesReadOnly", {}, openShared, {0}},
    {"OpenOnChannels", {}, openChannels, {0}},
    {"OpenOnAreas",
     {},
     call("initializeSession", R"({"nvmem_areas":"A/anAreaWithALongName"})"),
     {0}},
    {"OpenOnDevicesThatAreReserved", {openPlain, openDevices}, openDevices, {-250811}},
    {"OpenByForce", {openPlain, openDevices}, openForced, {0}},
    {"OpenOnABadName",
     {},
     call("initializeSession", R"({"physical_channels":"A/aChannelWithALongName9:0"})"),
     {-250828}},
    {"Close", {openDevices}, call("closeSession", ofSession), {0}},
    {"CloseNoSession", {openDevices}, call("closeSession", ofNoSession), {-250833}},
    {"Abort", {openPlain}, call("abortSession", ofSession), {0}},
    {"AbortNoSession", {}, call("abortSession", ofNoSession), {-250833}},
    {"Batch", {openPlain}, "[" + openDevices + "," + call("abortSession", ofSession) + "]", {0, 0}},
    {"BatchThatFails",
     {openPlain},
     "[" + openDevices + "," + call("closeSession", ofNoSession) + "," +
         call("abortSession", ofSession) + R"(,{"id":{"deep":["id",["of a skipped element"]]}}])",
     {0, -250833, -32001, -32001}},
    {"ParseError", {}, R"({"jsonrpc":"2.0","id":["a text","another",{"and":1.5e3}],,)", {-32700}},
    {"BlankBody", {}, std::string(70000, ' '), {-32700}},
    {"WrongRoot", {}, "[]", {-32600}},
    {"EnvelopeFault", {}, R"({"id":[[1,"two"],{"three":"a text of some length"}]})", {-32600}},
    {"LongId",
     {},
     R"({"jsonrpc":"2.0","id":")" + std::string(70000, 'x') + R"(","method":"closeSession"})",
     {-32602}},
    {"SchemaFault", {openPlain}, call("abortSession", R"({"session_id":5})"), {-32602}},
    {"ParamsThatAreNoObject", {}, call("abortSession", R"(["a","b","c"])"), {-32600}},
    {"UnknownMethod", {}, call("aMethodWithALongNameThatNobodyKnows", "{}"), {-32601}},
    onSession("connectToDevices", R"("devices":"Mod1")"),
    onSession("disconnectFromDevices", R"("devices":["Mod1","$DefaultDevices"])"),
    onSession("reserveDevices", R"("devices":"Mod1","access":"ReadOnly")"),
    onSession("unreserveDevices", R"("devices":"Mod1")"),
    onSession("resetDevices", R"("devices":"Mod1")"),
    onSession("renameDevice", R"("device":"Mod1","new_device_name":"aNewNameForTheDevice")"),
    onSession("getSessionPropertyList", ""),
    onSession("getDevicePropertyList", R"("device":"Mod1")"),
    onSession("getProperty", R"("property":"aPropertyOfTheDevice","devices":"Mod1")"),
    onSession("setProperty", R"("property":"aPropertyOfTheDevice","devices":"Mod1","value":1)"),
    onSession("commitProperties", R"("physical_channels":"Mod1/ch0")"),
    onSession("getPropertyInformation", R"("property":"aPropertyOfTheDevice","device":"Mod1")"),
    onSession("getCommandList", R"("device":"Mod1")"),
    onSession("executeCommand", R"("command":"Zero","devices":"Mod1","timeout":0.5)"),
    onSession("getCommandInformation", R"("command":"Zero","device":"Mod1")"),
    onSession("readRegister", R"("device":"Mod1","address":0,"size":64)"),
    onSession("writeRegister", R"("device":"Mod1","address":0,"size":8,"data":255)"),
    onSession("getNvmemBytes", R"("nvmem_area":"Mod1/user","address":0,"size":100)"),
    onSession("setNvmemBytes", R"("nvmem_area":"Mod1/user","address":0,"data":[1,2,3])"),
    onSession("commitNvmemAreas", R"("nvmem_areas":"Mod1/user")"),
    onSession("getModuleName", R"("device":"Bench","slot_number":2)"),
    onSession("renameChassisAndAllConnectedModules",
              R"("old_chassis_name":"Bench","new_chassis_name":"aNewNameForTheChassis")"),
    onSession("GetChassisIpOrHostname", R"("device":"Bench")"),
};

TEST(RequestAllocation, IsTriedWithEachMethod) {
    for (const nQITRMCWEBSVC100::Method& method : nQITRMCWEBSVC100::methodTable) {
        const std::string member = "\"method\":\"" + std::string(method.name) + "\"";
        EXPECT_TRUE(std::any_of(std::begin(scenarios), std::end(scenarios),
                                [&](const Scenario& scenario) {
                                    return scenario.body.find(member) != std::string::npos;
                                }))
            << method.name;
    }
}

using Parameter = std::tuple<AllocationFault::Extent, Scenario>;

class RequestAllocationTest : public ServiceTest, public testing::WithParamInterface<Parameter> {
  protected:
    void SetUp() override {
        ServiceTest::SetUp();
        giveKnownChassis();
    }

    std::string forLatestSession(std::string body) const {
        const std::size_t at = body.find('@');
        return at == body.npos ? body : body.replace(at, 1, std::to_string(sessions.opened()));
    }

    // Runs the request with one fault. Returns whether the fault was reached.
    bool postWithFault(const std::string& body, int successes) {
        ws_Request request;
        request.body = body;
        bool struck = false;
        {
            AllocationFault fault(successes, std::get<AllocationFault::Extent>(GetParam()));
            qitrmcRun(&entry, &request);
            struck = fault.hasStruck();
        }
        const Outcomes outcomes = outcomesOf(request.done);
        if (struck) {
            EXPECT_TRUE(isExcused(outcomes)) << testing::PrintToString(outcomes);
        } else {
            EXPECT_EQ(outcomes, scenario.undisturbed);
        }
        return struck;
    }

    // A request under a fault succeeds as without it or fails with out of memory. In a batch, one
    // element may fail so, and then the elements after it are skipped, or the whole batch may.
    bool isExcused(const Outcomes& outcomes) const {
        if (outcomes == Outcomes{httpServerError} || outcomes == Outcomes{outOfMemory} ||
            lacksWords(outcomes)) {
            return true;
        }
        const auto [outcome, undisturbed] =
            std::mismatch(outcomes.begin(), outcomes.end(), scenario.undisturbed.begin(),
                          scenario.undisturbed.end());
        if (outcomes.size() != scenario.undisturbed.size()) {
            return false;
        }
        return outcome == outcomes.end() ||
               (*outcome == outOfMemory && std::all_of(outcome + 1, outcomes.end(),
                                                       [](auto code) { return code == skipped; }));
    }

    const Scenario scenario = std::get<Scenario>(GetParam());
};

TEST_P(RequestAllocationTest, SucceedsOrFailsAsAWholeAndLeavesTheServiceUsable) {
    constexpr int limit = 5000;
    int successes = 0;
    // Makes the translator compile its scripts, which happens once per process.
    outcomesOfPost("{}");
    for (bool struck = true; struck && successes < limit && !HasFailure();
         successes += failureStep) {
        SCOPED_TRACE("allocation " + std::to_string(successes + 1));
        for (const std::string& body : scenario.before) {
            ASSERT_EQ(outcomesOfPost(body), Outcomes{0});
        }
        struck = postWithFault(forLatestSession(scenario.body), successes);
        expectSoundService();
    }
    EXPECT_LT(successes, limit);
    EXPECT_GT(successes, failureStep) << "no allocation failed";
    RecordProperty("allocations", successes - 1);
}

std::string nameOf(const testing::TestParamInfo<Parameter>& info) {
    const auto& [extent, scenario] = info.param;
    return std::string(scenario.name) +
           (extent == AllocationFault::Extent::One ? "_OneFails" : "_AllFailFromThere");
}

INSTANTIATE_TEST_SUITE_P(Faults, RequestAllocationTest,
                         testing::Combine(testing::Values(AllocationFault::Extent::One,
                                                          AllocationFault::Extent::AllFromThere),
                                          testing::ValuesIn(scenarios)),
                         nameOf);

}  // namespace
