#include "support/knownChassis.h"

#include <string>
#include <vector>

#include "support/RecordingDriver.h"

namespace {

using Texts = std::vector<std::string>;

RecordingDriver::Reply texts(Texts values) {
    RecordingDriver::Reply reply;
    reply.value = std::move(values);
    return reply;
}

bool has(const std::string& call, const char* part) {
    return call.find(part) != std::string::npos;
}

RecordingDriver::Reply systemTexts(const std::string& call) {
    if (has(call, "\"Sys.Devices\"")) {
        return texts({"Mod1", "Bench"});
    }
    if (has(call, "\"Sys.SessionProperties\"")) {
        return texts({"Session.Timeout", "Session.ReservedDevices"});
    }
    if (has(call, "\"Sys.SystemProperties\"")) {
        return texts({"Sys.Delay", "Sys.Devices", "Sys.Ticks", "Sys.Simulated"});
    }
    return texts({"Dev.Name", "Dev.Temperature", "PhysChan.Range", "NVMEM.Size"});
}

RecordingDriver::Reply genericTexts(const std::string& call) {
    if (has(call, "\"Dev.PhysChans\"")) {
        return texts({"Mod1/ch0"});
    }
    if (has(call, "\"Dev.NVMEM.Areas\"")) {
        return texts({"Mod1/user"});
    }
    if (has(call, "\"Dev.Modules\"")) {
        return texts({"Mod1"});
    }
    return texts({"one text of an array", "another text of an array"});
}

void answer(const char* call, RecordingDriver::Reply (*workedOut)(const std::string&)) {
    RecordingDriver::Reply reply;
    reply.workedOut = workedOut;
    RecordingDriver::instance().reply(call, std::move(reply));
}

}  // namespace

void giveKnownChassis() {
    RecordingDriver& driver = RecordingDriver::instance();
    answer("getSystemPropertyStringArray", systemTexts);
    answer("getGenericPropertyStringArray", genericTexts);
    driver.give("openDriverDefinedProperty", std::uint64_t{21});
    driver.give("openGenericProperty", std::uint64_t{22});
    driver.give("openGenericCommand", std::uint64_t{31});
    driver.give("translateStaticEnumValueToString", std::string("AnItemWithALongName"));
    driver.give("getPropertyPropertyInt32", std::int64_t{3});
    driver.give("getPropertyPropertyBool", std::uint64_t{1});
    driver.give("getPropertyPropertyString", std::string("a text of a property"));
    driver.give("getPropertyPropertyStringArray", Texts{"an item of an enumeration", "B"});
    driver.give("getPropertyPropertyInt32Array", std::vector<std::int64_t>{1, 2});
    driver.give("getGenericPropertyInt32", std::int64_t{1});
    driver.give("getGenericPropertyUInt32", std::uint64_t{2});
    driver.give("getCommandPropertyString", std::string("a text of a command"));
    driver.give("getDevicePropertyString", std::string("a text of a device"));
}
