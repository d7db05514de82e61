#include "description/Summary.h"

#include <algorithm>

namespace simulator {

namespace {

std::size_t longestName(const Chassis& chassis) {
    std::size_t longest = 0;
    for (const auto& device : chassis.devices()) {
        longest = std::max(longest, device->name.size());
    }
    return longest;
}

std::string textOf(const Device& device, const char* property) {
    const Property* found = device.properties.find(property);
    return found == nullptr ? "" : firstText(found->value);
}

void addPart(std::string& line, const std::string& part) {
    if (!part.empty()) {
        line += (line.empty() ? "" : ", ") + part;
    }
}

// The channels of a device are numbered from 0, after a common prefix.
std::string channels(const Device& device) {
    if (device.physChans.empty()) {
        return "";
    }
    const std::string first = device.physChans.front()->name;
    const std::size_t more = device.physChans.size() - 1;
    return first + (more == 0 ? "" : ":" + std::to_string(more));
}

std::string areas(const Device& device) {
    std::string text;
    for (const auto& area : device.nvmemAreas) {
        text += (text.empty() ? "NVMEM " : " and ") + area->name + " (" +
                std::to_string(area->memory.size()) + " bytes)";
    }
    return text;
}

std::string partsOf(const Device& device) {
    std::string line;
    addPart(line, textOf(device, "Dev.ProductName"));
    const std::string serial = textOf(device, "Dev.SerialNum");
    addPart(line, serial.empty() ? "" : "serial number " + serial);
    addPart(line, textOf(device, "Dev.TCPIP.EthernetIP"));
    addPart(line, channels(device));
    addPart(line, areas(device));
    return line;
}

std::string lineOf(const Device& device, const std::string& place, std::size_t nameWidth) {
    std::string line = "  " + place + device.name;
    const std::string parts = partsOf(device);
    if (!parts.empty()) {
        line += std::string(nameWidth - device.name.size() + 2, ' ') + parts;
    }
    return line + "\n";
}

std::string slotOf(const Device& module) {
    const std::string number = std::to_string(module.slot);
    return "  slot " + std::string(number.size() < 2 ? 1 : 0, ' ') + number + "  ";
}

}  // namespace

std::string summaryOf(const Chassis& chassis) {
    const std::size_t nameWidth = longestName(chassis);
    std::string text;
    for (const auto& device : chassis.devices()) {
        if (device->slot != 0) {
            continue;
        }
        text += lineOf(*device, "", nameWidth);
        std::vector<const Device*> modules(device->modules.begin(), device->modules.end());
        std::sort(modules.begin(), modules.end(),
                  [](const Device* left, const Device* right) { return left->slot < right->slot; });
        for (const Device* module : modules) {
            text += lineOf(*module, slotOf(*module), nameWidth);
        }
    }
    return text;
}

}  // namespace simulator
