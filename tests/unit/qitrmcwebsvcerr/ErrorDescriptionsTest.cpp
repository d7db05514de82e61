#include "qitrmcwebsvcerr/ErrorDescriptions.h"

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {
namespace {

using nQITRMCSHAREDCMN100::InternalError;

const std::map<std::string, std::string>& expectedDescriptions() {
    static const std::map<std::string, std::string> descriptions = {
        {"UnsupportedParams", "This parameter you specified is unsupported."},
        {"WrongParameterType", "Wrong parameter data type. The data type must be %s."},
        {"ParameterRequired", "The following parameter(s) is required: %s."},
        {"InvalidSessionIdFormat",
         "Wrong session ID format. The format of a session ID must be _session<number>. For "
         "example, a session ID can be _session1."},
        {"InvalidEnumItem",
         "Wrong enum item. The enum item must be one of the following items: %s"},
        {"LessThanMinValue", "The number must be greater than or equal to %s"},
        {"GreaterThanMaxValue", "The number must be less than or equal to %s"},
        {"EmptyArray", "The parameter must not be empty array."},
        {"WrongDevicesType",
         "Wrong data type for parameter devices. The data type must be string or array of string."},
        {"WrongPhysicalChannelsType",
         "Wrong data type for parameter physical_channels. The data type must be string or array "
         "of string."},
        {"WrongNvmemAreasType",
         "Wrong data type for parameter nvmem_areas. The data type must be string or array of "
         "string."},
        {"WrongPropertyType",
         "Wrong data type for parameter property. The data type must be one of the following data "
         "types: boolean, string, number, array of boolean, array of string, or array of number."},
        {"OneOfDeviceSupported", "You must specify none or only one device."},
        {"OneOfDevicePhyChannelSupported",
         "You must specify none or only one of the following parameters: device, "
         "physical_channel."},
        {"OneOfDevicesPhyChannelsSupported",
         "You must specify none or only one of the following parameters: devices, "
         "physical_channels."},
        {"OneOfDevicesNvmemsSupported",
         "You must specify none or only one of the following parameters: devices, nvmem_areas."},
        {"OneOfDeviceNvmemPhyChannelSupported",
         "You must specify none or only one of the following parameters: device, physical_channel, "
         "nvmem_area."},
        {"OneOfDevicesNvmemsPhyChannelsSupported",
         "You must specify none or only one of the following parameters: devices, "
         "physical_channels, nvmem_areas."},
        {"MustSpecifyOneOfDevicePhyChannel",
         "You must specify at least one of the following parameters: device, physical_channel."},
        {"MustSpecifyOneOfDeviceNvmemPhyChannel",
         "You must specify at least one of the following parameters: device, physical_channel, "
         "nvmem_area."},
        {"MustSpecifyOneOfDevicesNvmemsPhyChannels",
         "You must specify at least one of the following parameters: devices, physical_channels, "
         "nvmem_areas."},
    };
    return descriptions;
}

std::string statusTextOfLookup(const std::string& name) {
    try {
        getErrorDescription(name);
    } catch (const InternalError& error) {
        EXPECT_EQ(error.status()->code, -250800);
        return error.status()->json ? error.status()->json : "";
    }
    ADD_FAILURE() << name << " is in the table";
    return "";
}

TEST(ErrorDescriptions, HaveATextForEachOfThe21Names) {
    ASSERT_EQ(expectedDescriptions().size(), 21u);
    for (const auto& [name, text] : expectedDescriptions()) {
        EXPECT_EQ(text, getErrorDescription(name)) << name;
    }
}

TEST(ErrorDescriptions, LeaveThePlaceholderInPlace) {
    EXPECT_EQ(getErrorDescription("GreaterThanMaxValue"),
              "The number must be less than or equal to %s");
}

TEST(ErrorDescriptions, RefuseANameThatDiffersInCaseOrLength) {
    for (const char* name : {"emptyArray", "EMPTYARRAY", "EmptyArray ", "EmptyArra", ""}) {
        EXPECT_NE(std::string::npos,
                  statusTextOfLookup(name).find("\"Fail to get error description\""))
            << name;
    }
}

TEST(ErrorDescriptions, ReportWhereARefusedNameWasLookedUp) {
    const std::string text = statusTextOfLookup("unknown");
    EXPECT_NE(std::string::npos, text.find("ErrorDescriptions.cpp\"")) << text;
    EXPECT_NE(std::string::npos, text.find("\"component\":\"qitrmcsvc\"")) << text;
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
