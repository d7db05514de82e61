// Descriptions of faults that are refused.

#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr std::int32_t invalidFaults = -250942;

void expectRefused(const std::string& json, const std::string& reason) {
    const Setting setting = setFaults(json);
    EXPECT_EQ(setting.code, invalidFaults) << json;
    EXPECT_EQ(setting.reason, reason) << json;
}

// A valid fault, with further members.
void expectMemberRefused(const std::string& members, const std::string& reason) {
    expectRefused(oneFault("\"delay\":0," + members), "/faults/0/" + reason);
}

std::string event(const std::string& members) {
    return "{\"events\":[{" + members + "}]}";
}

TEST(FaultReaderTest, WhatIsNotJsonIsRefused) {
    expectRefused("",
                  "is not JSON at line 1, column 1: The document is empty; "
                  "a description of faults is one JSON object");
}

TEST(FaultReaderTest, WhatIsNotAnObjectIsRefused) {
    expectRefused("[]", "is an array; must be an object");
    expectRefused("{\"faults\":{}}", "/faults is an object; must be an array");
    expectRefused("{\"events\":7}", "/events is 7; must be an array");
    expectRefused("{\"faults\":[7]}", "/faults/0 is 7; must be an object");
}

TEST(FaultReaderTest, UnknownMembersAreRefused) {
    expectRefused("{\"fault\":[]}",
                  "/fault is not a known member; perhaps \"faults\" is meant; the members here are "
                  "$schema, seed, faults, events");
    expectMemberRefused(
        "\"chance\":1",
        "chance is not a known member; the members here are function, method, resource, "
        "calls, probability, after, lasts, delay, status, moment, output");
    expectMemberRefused(
        "\"calls\":{\"last\":1}",
        "calls/last is not a known member; the members here are first, count, every");
    expectMemberRefused("\"output\":{\"size\":1}",
                        "output/size is not a known member; the members here are null, null_items, "
                        "text_size, count");
    expectRefused(event("\"devices\":\"Mod1\""),
                  "/events/0/devices is not a known member; perhaps \"device\" is meant; the "
                  "members here are device, event, "
                  "after, lasts");
}

TEST(FaultReaderTest, ASeedHas32Bits) {
    EXPECT_EQ(setFaults("{\"seed\":4294967295}").code, 0);
    expectRefused("{\"seed\":-1}", "/seed is -1; must be a whole number from 0 to 4294967295");
}

TEST(FaultReaderTest, AFunctionMustBeOneOfTheDriver) {
    const std::string words =
        "function is not a function of the driver that has a status; must be the name of one "
        "without nQITRMCAPI100_, or its beginning with a star";
    for (const char* name : {"", "get", "Abort*", "freeString", "translateStatic*"}) {
        expectMemberRefused("\"function\":\"" + std::string(name) + "\"", words);
    }
    for (const char* name : {"abortSession", "abortSession*", "a*", "*", "writeRegisterUInt64"}) {
        EXPECT_EQ(
            setFaults(oneFault("\"delay\":0,\"function\":\"" + std::string(name) + "\"")).code, 0)
            << name;
    }
    EXPECT_EQ(setFaults("{}").code, 0);
}

TEST(FaultReaderTest, TheNearestFunctionIsSuggested) {
    const std::pair<const char*, const char*> suggestions[] = {
        {"nQITRMCAPI100_abortSession", "abortSession"},
        {"abortSession**", "abortSession"},
        {"ABORTSESSION", "abortSession"},
        {"readRegisterUint8", "readRegisterUInt8"},
        {"getGenericPropertyInteger", "getGenericPropertyInt32"},
        {"intializeSessionWithDevices", "initializeSessionWithDevices"}};
    for (const auto& [given, nearest] : suggestions) {
        expectMemberRefused(
            "\"function\":\"" + std::string(given) + "\"",
            "function is not a function of the driver that has a status; perhaps \"" +
                std::string(nearest) +
                "\" is meant; must be the name of one without nQITRMCAPI100_, or "
                "its beginning with a star");
    }
}

TEST(FaultReaderTest, AMethodMustBeOneOfTheService) {
    expectMemberRefused("\"method\":\"abort\"",
                        "method is not a method of the service; must be the name of one");
    expectMemberRefused("\"method\":\"getChassisIpOrHostname\"",
                        "method is not a method of the service; perhaps "
                        "\"GetChassisIpOrHostname\" is meant; must be the name of one");
    expectMemberRefused("\"method\":\"readRegister\",\"function\":\"readRegisterUInt8\"",
                        "method stands beside a function; must be without one");
}

TEST(FaultReaderTest, AMethodStandsForItsFunctions) {
    Session session("Mod1");
    const FaultsInForce faults(oneFault("\"method\":\"readRegister\",\"status\":{\"code\":-77}"));
    Status reading;
    std::uint8_t byte = 0;
    nQITRMCAPI100_readRegisterUInt8(session, "Mod1", 0, &byte, &reading);
    EXPECT_EQ(reading.code, -77);
    Status wide;
    std::uint64_t number = 0;
    nQITRMCAPI100_readRegisterUInt64(session, "Mod1", 0, &number, &wide);
    EXPECT_EQ(wide.code, -77);
    Status writing;
    nQITRMCAPI100_writeRegisterUInt8(session, "Mod1", 256, 0, &writing);
    EXPECT_EQ(writing.code, 0) << writing.text();
    EXPECT_EQ(session.list("Session.DefaultDevices"), Names{"Mod1"});
}

TEST(FaultReaderTest, AResourceMustExist) {
    for (const char* name :
         {"Mod3", "", "Mod1/ch4", "Mod1,Mod2", "Mod1/ch0:1", "$DefaultDevices"}) {
        expectMemberRefused("\"resource\":\"" + std::string(name) + "\"",
                            "resource is not a resource of the chassis; must be the name of a "
                            "device, or of a channel or area such as Mod1/ch0");
    }
}

TEST(FaultReaderTest, CallsAreCountedFrom1) {
    for (const char* name : {"first", "count", "every"}) {
        expectMemberRefused("\"calls\":{\"" + std::string(name) + "\":0}",
                            "calls/" + std::string(name) +
                                " is 0; must be a whole number from 1 to "
                                "4294967295");
    }
}

TEST(FaultReaderTest, AProbabilityLiesBetween0And1) {
    const std::string rule = "; must be a number from 0 to 1";
    for (const std::string number : {"-0.1", "1.01", "true"}) {
        expectMemberRefused("\"probability\":" + number, "probability is " + number + rule);
    }
    expectMemberRefused("\"probability\":\"1\"", "probability is the text \"1\"" + rule);
}

TEST(FaultReaderTest, ADelayIsATime) {
    expectRefused(oneFault("\"delay\":-1"),
                  "/faults/0/delay is -1; must be a time in seconds, from 0 "
                  "to a day");
}

TEST(FaultReaderTest, AStatusMustBeValid) {
    expectRefused(oneFault("\"status\":{}"),
                  "/faults/0/status/code is missing; must be the number of the status");
    expectRefused(oneFault("\"status\":{\"code\":0}"),
                  "/faults/0/status/code is 0; must be a number other than "
                  "0, which means success");
}

TEST(FaultReaderTest, AMomentIsBeforeOrAfterAndNeedsAFailure) {
    expectMemberRefused("\"status\":{\"code\":-1},\"moment\":\"later\"",
                        "moment is the text \"later\"; must be before or after");
    for (const char* status : {"", "\"status\":{\"code\":1},"}) {
        expectMemberRefused(status + std::string("\"moment\":\"after\""),
                            "moment belongs to no failure; only with a status below 0 there is a "
                            "moment of failing");
    }
}

TEST(FaultReaderTest, OutputsMustBePossible) {
    expectMemberRefused("\"output\":{}",
                        "output changes nothing; must have null, null_items, text_size or count");
    expectMemberRefused("\"output\":{\"null\":false}",
                        "output changes nothing; must have null, null_items, text_size or count");
    for (const char* members :
         {"\"null\":true,\"text_size\":1", "\"null\":true,\"null_items\":true",
          "\"null_items\":true,\"text_size\":1"}) {
        expectMemberRefused("\"output\":{" + std::string(members) + "}",
                            "output says several things about one text; must have one of null, "
                            "null_items and text_size");
    }
    expectMemberRefused("\"output\":{\"null\":true},\"status\":{\"code\":-1}",
                        "output belongs to a call that fails; a call that fails gives nothing out");
}

TEST(FaultReaderTest, OutputsAreBounded) {
    expectMemberRefused("\"output\":{\"text_size\":1073741825}",
                        "output/text_size is 1073741825; must be a whole number from "
                        "0 to 1073741824");
    expectMemberRefused("\"output\":{\"count\":16777217}",
                        "output/count is 16777217; must be a whole number from 0 "
                        "to 16777216");
    expectMemberRefused("\"output\":{\"count\":2,\"text_size\":536870913}",
                        "output is too large; text_size times count must be at most 1073741824");
}

TEST(FaultReaderTest, AFaultMustDoSomething) {
    expectRefused(oneFault(""), "/faults/0 does nothing; must have delay, status or output");
    expectRefused(oneFault("\"function\":\"abortSession\""),
                  "/faults/0 does nothing; must have delay, status or output");
}

TEST(FaultReaderTest, AnEventNeedsADeviceAndAKind) {
    expectRefused(event(""), "/events/0/device is missing; must be the name of a device");
    for (const char* name : {"Mod3", "Mod1/ch0", "$DefaultDevices"}) {
        expectRefused(event("\"device\":\"" + std::string(name) + "\",\"event\":\"pulled\""),
                      "/events/0/device is not a device of the chassis; must be the name of one");
    }
    expectRefused(event("\"device\":\"Mod1\""),
                  "/events/0/event is missing; must be pulled or connection_lost");
    expectRefused(event("\"device\":\"Mod1\",\"event\":\"burnt\""),
                  "/events/0/event is the text \"burnt\"; must be pulled or "
                  "connection_lost");
    expectRefused(event("\"device\":\"Mod1\",\"event\":\"pulled\",\"after\":-1"),
                  "/events/0/after is -1; must be a time in seconds, from 0 "
                  "to a day");
    expectRefused(event("\"device\":\"Mod1\",\"event\":\"pulled\",\"lasts\":\"long\""),
                  "/events/0/lasts is the text \"long\"; must be a time in seconds, from 0 "
                  "to a day");
}

TEST(FaultReaderTest, OnlyModulesCanBeRemoved) {
    expectRefused(event("\"device\":\"Bench\",\"event\":\"pulled\""),
                  "/events/0/event befalls a device that is no module; only what stands in a slot "
                  "can be pulled");
}

TEST(FaultReaderTest, ABrokenTextKeepsThePreviousFaults) {
    Session session;
    const FaultsInForce faults(oneFault("\"function\":\"abortSession\",\"status\":{\"code\":-77}"));
    EXPECT_EQ(setFaults("{").code, invalidFaults);
    EXPECT_EQ(session.abort(), -77);
}

TEST(FaultReaderTest, TheReasonMayBeOmitted) {
    EXPECT_EQ(qitrmcsim_setFaults("{", nullptr), invalidFaults);
    EXPECT_EQ(qitrmcsim_setFaults("{}", nullptr), 0);
}

TEST(FaultReaderTest, ANullTextIsRefused) {
    char* reason = nullptr;
    EXPECT_EQ(qitrmcsim_setFaults(nullptr, &reason), -250954);
    EXPECT_EQ(reason, detailsOf("missingArgument", usage("ArgumentName", "\"json\"")));
    nQITRMCAPI100_freeString(reason);
    EXPECT_EQ(qitrmcsim_setFaults("{}", &reason), 0);
    EXPECT_EQ(reason, nullptr);
}

}  // namespace
