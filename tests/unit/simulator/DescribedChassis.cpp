// The chassis for the tests of described registers, commands and statuses.

#include <gtest/gtest.h>

#include "ChassisFile.h"

namespace {

constexpr const char* description = R"({
    "enums": {"Phase": {"Idle": 0, "Busy": 7}},
    "devices": [{
        "name": "Unit", "category": 7,
        "properties": {
            "Gain": {"type": "Double", "access": "ReadWrite", "value": 1.5, "min": -100, "max": 100},
            "Free": {"type": "Double", "access": "ReadWrite", "value": 0},
            "Flag": {"type": "Bool", "access": "ReadWrite", "value": true},
            "Signed": {"type": "Int32", "access": "ReadWrite", "value": -2},
            "Long": {"type": "Int64", "access": "ReadWrite", "value": -2},
            "Count": {"type": "UInt32", "value": 4293844428},
            "Wide": {"type": "UInt64", "access": "ReadWrite", "value": 72623859790382856},
            "Held": {"type": "UInt32", "access": "ReadWrite", "needs_commit": true, "value": 1},
            "Phase": {"type": "Int32", "access": "ReadWrite", "enum": "Phase", "value": "Idle"},
            "Secret": {"type": "UInt32", "access": "WriteOnly", "value": 0},
            "Runs": {"type": "UInt32", "value": 0},
            "Steps": {"type": "UInt32", "value": 1, "min": 1, "max": 10},
            "Big": {"type": "Double", "value": 1e308},
            "Jittery": {"type": "UInt32", "access": "ReadWrite", "value": 0},
            "Cycles": {"type": "UInt64", "value": 0},
            "Texts": {"type": "StringArray", "access": "ReadWrite", "value": ["a"]},
            "Note": {"type": "String", "access": "ReadWrite", "value": ""}
        },
        "live": {"Jittery": {"noise": 6}},
        "commands": {
            "Run": {"adds": {"Runs": 1}},
            "Raise": {"adds": {"Steps": 20}},
            "Grow": {"adds": {"Big": 1e308}},
            "Slow": {"seconds": 86400, "adds": {"Runs": 1}},
            "Short": {"seconds": 0.05, "adds": {"Runs": 1},
                      "fails": {"status": {"code": -7}}},
            "Always": {"adds": {"Runs": 1}, "fails": {"status": {"code": -1, "constant": "broken"}}},
            "Busy": {"adds": {"Runs": 1}, "sets": {"Phase": "Busy"},
                     "fails": {"when": {"property": "Phase", "is": "Busy"},
                               "status": {"code": -2}}},
            "Listed": {"fails": {"when": {"property": "Texts", "is": ["a", "b"]},
                                 "status": {"code": -2}}},
            "Secretive": {"fails": {"when": {"property": "Secret", "is": 5},
                                    "status": {"code": -2}}},
            "Third": {"adds": {"Runs": 1}, "fails": {"every": 3, "status": {"code": -3}}},
            "Second": {"seconds": 0.01, "fails": {"every": 2, "status": {"code": -8}}},
            "Never": {"fails": {"probability": 0, "status": {"code": -4}}},
            "Surely": {"fails": {"probability": 1, "status": {"code": -4}}},
            "Perhaps": {"fails": {"probability": 0.5, "status": {"code": -4}}},
            "Rarely": {"fails": {"probability": 0.1, "status": {"code": -4}}},
            "Warns": {"adds": {"Runs": 1},
                      "fails": {"status": {"code": 5, "constant": "warm", "details": []}}},
            "Resets": {"resets": true, "adds": {"Runs": 5}, "on_device": {"adds": {"Cycles": 2}}},
            "Rich": {"fails": {"status": {
                "code": -2147483648, "constant": "rich \"one\"",
                "details": [
                    {"usage": "kUsageTypeDevice", "value": "Größe"},
                    {"usage": "kUsageTypeRegisterAddress", "value": 4294967295},
                    {"usage": "kUsageTypeDevices", "value": ["a", "b"]},
                    {"usage": "kUsageTypeDevices", "value": []},
                    {"usage": "kUsageTypeRequestedValue", "item": -9, "enum": "Phase"},
                    {"elaboration": "kAuxTermOperationNotAllowed"},
                    {"header": "kAuxTermUnreachableDevices"},
                    {"empty": true}
                ]}}},
            "Caused": {"fails": {"status": {
                "code": -1, "causes": [{"code": -2, "constant": "why",
                                        "causes": [{"code": -3}, {"code": 4}]}]}}},
            "Malformed": {"fails": {"status": {"code": -9, "json": "{\"translator\": [tr"}}},
            "Blank": {"fails": {"status": {"code": -9, "json": ""}}}
        },
        "channels": {
            "prefix": "ch", "count": 2,
            "properties": {
                "Level": {"type": "Double", "access": "ReadWrite", "value": 0, "min": 0, "max": 30},
                "Fault": {"type": "Bool", "access": "ReadWrite", "value": false}
            },
            "commands": {
                "Switch": {"sets": {"Level": 5}, "on_device": {"adds": {"Cycles": 1},
                                                               "sets": {"Note": "switched"}},
                           "fails": {"when": {"property": "Fault", "is": true},
                                     "status": {"code": -6}}}
            }
        },
        "registers": [
            {"address": 512, "size": 8, "shows": {"property": "Level", "resource": "ch1"}},
            {"address": 640, "size": 4, "shows": "Jittery"},
            {"address": 0, "size": 16, "bytes": "0102030405060708090a0b0c0d0e0f10",
             "on_read": "clear"},
            {"address": 16, "size": 8, "bytes": "ffffffffffffffff", "on_write": "ones_clear"},
            {"address": 24, "size": 8, "access": "WriteOnly"},
            {"address": 32, "size": 1, "width": 8}, {"address": 34, "size": 2, "width": 16},
            {"address": 36, "size": 4, "width": 32}, {"address": 40, "size": 8, "width": 64},
            {"address": 48, "size": 4, "runs": "Run"},
            {"address": 52, "size": 4, "runs": "Slow"},
            {"address": 56, "size": 4, "runs": "Always"},
            {"address": 60, "size": 4, "runs": "Warns"},
            {"address": 64, "size": 4, "bytes": "ffffffff", "runs": "Run",
             "on_write": "ones_clear", "on_read": "clear"},
            {"address": 128, "size": 8, "shows": "Wide"},
            {"address": 136, "size": 4, "shows": "Count"},
            {"address": 140, "size": 4, "shows": "Signed"},
            {"address": 144, "size": 2, "shows": "Signed"},
            {"address": 146, "size": 1, "shows": "Signed"},
            {"address": 147, "size": 1, "shows": "Flag"},
            {"address": 148, "size": 4, "shows": "Flag"},
            {"address": 152, "size": 8, "shows": "Gain"},
            {"address": 160, "size": 4, "shows": "Gain"},
            {"address": 164, "size": 4, "shows": "Phase"},
            {"address": 168, "size": 4, "shows": "Held"},
            {"address": 172, "size": 4, "access": "WriteOnly", "shows": "Secret"},
            {"address": 176, "size": 4, "access": "ReadOnly", "shows": "Held"},
            {"address": 180, "size": 2, "shows": "Long"},
            {"address": 184, "size": 8, "shows": "Long"},
            {"address": 192, "size": 4, "shows": "Free"},
            {"address": 200, "size": 8, "shows": "Free"}
        ]
    }]
})";

// The library reads the description when it is first used.
class UseDescription : public testing::Environment {
  public:
    void SetUp() override { setenv("QITRMC_SIM_CHASSIS", file.path.c_str(), 1); }

  private:
    drivertest::ChassisFile file{description};
};

const auto* const environment = testing::AddGlobalTestEnvironment(new UseDescription);

}  // namespace
