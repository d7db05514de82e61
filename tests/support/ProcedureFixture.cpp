#include "support/ProcedureFixture.h"

#include <algorithm>

#include "qitrmcwebsvc/compactJson.h"
#include "unit/qitrmcwebsvc/requests.h"

using namespace nQITRMCWEBSVC100;

namespace {

constexpr const char* dataTypeNames[] = {"Bool",        "Double",     "Int32",      "Int64",
                                         "String",      "UInt32",     "UInt64",     "BoolArray",
                                         "DoubleArray", "Int32Array", "Int64Array", "StringArray",
                                         "UInt32Array", "UInt64Array"};

// The source position of the failure is left out.
std::string written(const qierr_Status& status) {
    const std::string details = orderedDataOf(status);
    return std::to_string(status.code) + (details.empty() ? "" : " " + details);
}

std::shared_ptr<IProcedure> make(ProcedureFactory& factory, const std::string& name) {
    for (const Method& method : methodTable) {
        if (method.name == name) {
            return (factory.*method.make)();
        }
    }
    throw std::out_of_range(name);
}

}  // namespace

void ProcedureFixture::SetUp() {
    DriverTest::SetUp();
    for (const char* suffix : {"outResources", "Devices", "PhysChans", "NvmemAreas"}) {
        give(std::string("initializeSessionWith") + suffix, std::uint64_t{7});
    }
    const auto giveList = [this](const std::string& name, Texts names) {
        give("getSystemPropertyStringArray(7, \"" + name + "\")", std::move(names));
    };
    giveList("Sys.Devices", {"Mod1", "Mod2", "Mod3", "Bench"});
    giveList("Sys.SessionProperties",
             {"Session.Timeout", "Session.ReservedDevices", "Session.Name", "Session.Language"});
    giveList("Sys.SystemProperties",
             {"Sys.Simulated", "Sys.ConfigChangeCount", "Sys.Devices", "Sys.Delay", "Sys.Ticks"});
    giveList("Sys.DeviceProperties", {"Dev.Temperature", "Dev.Events", "Dev.Name"});
    giveList("Sys.PhysChanProperties", {"PhysChan.Range", "PhysChan.Events"});
    giveList("Sys.NVMEMAreaProperties", {"NVMEM.Size"});
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.PhysChans\")",
         Texts{"Mod1/ch0", "Mod1/ch1", "Mod1/ch2"});
    give("getGenericPropertyStringArray(7, \"Mod2\", \"Dev.PhysChans\")", Texts{"Mod2/ch0"});
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")", Texts{"Mod1/user"});
    give("openDriverDefinedProperty", std::uint64_t{21});
    give("openGenericProperty", std::uint64_t{22});
    give("openGenericCommand", std::uint64_t{31});
    for (int i = 0; i < 14; ++i) {
        give("translateStaticEnumValueToString(\"DataType\", " + std::to_string(i + 1) + ")",
             std::string(dataTypeNames[i]));
    }
    factory = std::make_unique<ProcedureFactory>();
}

void ProcedureFixture::TearDown() {
    factory.reset();
    DriverTest::TearDown();
}

void ProcedureFixture::openSession(const std::string& members) {
    ask("closeSession");
    EXPECT_EQ(request("initializeSession", "{" + members + "}"), R"({"session_id":"_session7"})");
    driver.takeCalls();
}

std::string ProcedureFixture::ask(const std::string& method, const std::string& members) {
    const std::string separator = members.empty() ? "" : ",";
    return request(method, R"({"session_id":"_session7")" + separator + members + "}");
}

std::string ProcedureFixture::request(const std::string& method, const std::string& params) {
    const ParsedRequest parsed(requestText(method, params));
    JsonDocument answer;
    SingleResponse response(&answer.GetAllocator());
    try {
        make(*factory, method)->execute(*parsed, response);
    } catch (const std::exception& caught) {
        EXPECT_FALSE(response.getValue().HasMember("result"));
        qierr::Status status;
        nQITRMCSHAREDCMN100::captureCurrentException(caught, &status);
        statusText = status.json != nullptr ? status.json : "";
        return written(status);
    }
    return compactJson(response.getValue()["result"]);
}

void ProcedureFixture::give(const std::string& call, RecordingDriver::Value value) {
    given[call] = {std::move(value)};
    driver.reply(call, given[call]);
}

void ProcedureFixture::fail(const std::string& call, std::int32_t code, const std::string& json) {
    driver.fail(call, code, json);
}

void ProcedureFixture::failLater(const std::string& call, int earlier, std::int32_t code) {
    if (earlier == 0) {
        return fail(call, code);
    }
    const auto standing =
        given.count(call) != 0 ? given.find(call) : given.find(call.substr(0, call.find('(')));
    RecordingDriver::Reply reply =
        standing != given.end() ? standing->second : RecordingDriver::Reply{};
    reply.during = [this, call, code, left = std::make_shared<int>(earlier)] {
        if (--*left == 0) {
            fail(call, code);
        }
    };
    driver.reply(call, reply);
}

void ProcedureFixture::giveDataType(std::int32_t number) {
    for (const char* handle : {"21", "22"}) {
        give("getPropertyPropertyInt32(" + std::string(handle) + ", \"Prop.DataType\")",
             std::int64_t{number});
    }
}

Texts afterOpening(const Texts& calls) {
    const auto last = std::find_if(calls.rbegin(), calls.rend(), [](const std::string& call) {
        return call.find("\"Prop.DataType\"") != std::string::npos;
    });
    EXPECT_NE(last, calls.rend()) << "no property was opened";
    return Texts(last.base(), calls.end());
}

std::string failure(std::int32_t code, const std::string& usage, const std::string& value) {
    return std::to_string(code) + " [" + nQITRMCWEBSVC100::usage(usage, value) + "]";
}

std::string internalError(const std::string& comment) {
    return R"(-250800 [{"type":"comment","comment":")" + comment + R"("}])";
}
