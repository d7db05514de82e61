#include "description/ChassisReader.h"
#include "description/Description.h"
#include "harnesses.h"

namespace {

void requireSoundNames(const simulator::Chassis& chassis) {
    for (const auto& device : chassis.devices()) {
        fuzz::require(chassis.findDevice(device->name) == device.get(), "a device is not found");
        for (const auto& channel : device->physChans) {
            fuzz::require(chassis.find(channel->fullName()) == channel.get(),
                          "a channel is not found");
        }
        for (const auto& area : device->nvmemAreas) {
            fuzz::require(chassis.find(area->fullName()) == area.get(), "an area is not found");
            fuzz::require(area->memory.size() > 0, "an area without bytes");
        }
    }
}

void requireWords(const simulator::DescriptionError& error) {
    fuzz::require(error.pointer.empty() || error.pointer.front() == '/', "no JSON pointer");
    fuzz::require(!error.wrong.empty() && !error.right.empty(), "a error without words");
}

}  // namespace

void fuzz::parseChassis(std::string_view input) {
    try {
        requireSoundNames(*simulator::parseChassis(input).chassis);
    } catch (const simulator::DescriptionError& error) {
        requireWords(error);
    }
}
