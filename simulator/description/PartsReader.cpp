#include "description/PartsReader.h"

#include "Members.h"
#include "common/digits.h"
#include "description/CommandReader.h"
#include "description/Nearest.h"
#include "model/NameText.h"

namespace simulator {

using common::hexDigit;

namespace {

constexpr std::uint32_t mostChannels = 1024;
constexpr std::uint32_t mostBytes = 16u << 20;

bool readWritable(const Node& node) {
    if (!node.has("access")) {
        return true;
    }
    const Node access = node.member("access", "");
    const std::string name = access.text();
    if (name != "ReadOnly" && name != "ReadWrite") {
        access.fail("is " + access.shown(), perhapsMeant(name, {"ReadOnly", "ReadWrite"}) +
                                                "must be ReadOnly or ReadWrite");
    }
    return name == "ReadWrite";
}

}  // namespace

std::string readName(const Node& node, std::string (*errorOf)(std::string_view)) {
    const std::string name = node.text();
    const std::string fault = errorOf(name);
    if (!fault.empty()) {
        node.fail("is " + node.shown() + ", which is not a name", fault);
    }
    return name;
}

std::vector<std::uint8_t> readBytes(const Node& node) {
    const Node sizeNode = node.member("size", "the number of bytes");
    std::vector<std::uint8_t> bytes(sizeNode.unsignedNumber(1, mostBytes));
    if (!node.has("bytes")) {
        return bytes;
    }
    const Node textNode = node.member("bytes", "");
    const std::string text = textNode.text();
    if (text.size() % 2 != 0 || text.size() / 2 > bytes.size()) {
        textNode.fail("has " + std::to_string(text.size()) + " digits",
                      "must be two digits for each byte, at most " +
                          std::to_string(2 * bytes.size()) + " for this size");
    }
    for (std::size_t i = 0; i < text.size(); i += 2) {
        const int high = hexDigit(text[i]);
        const int low = hexDigit(text[i + 1]);
        textNode.expect(high >= 0 && low >= 0, "hexadecimal digits without blanks or 0x");
        bytes[i / 2] = static_cast<std::uint8_t>(high * 16 + low);
    }
    return bytes;
}

void readResource(const Node& node, Category category, const Chassis& chassis,
                  const Enumerations& enumerations, Resource& resource) {
    if (node.has("values")) {
        const Node values = node.member("values", "");
        fillStore(category, chassis.catalogue, &values, resource.properties);
    } else {
        fillStore(category, chassis.catalogue, nullptr, resource.properties);
    }
    node.ifPresent("properties", [&](const Node& definitions) {
        addOwnProperties(definitions, category, chassis.catalogue, enumerations,
                         resource.properties);
    });
    node.ifPresent("commands", [&](const Node& commands) {
        commands.forEachMember([&](const std::string& name, const Node& entry) {
            expectWritableName(name, entry);
            resource.commands.push_back(readCommand(name, entry, resource, enumerations));
        });
    });
}

void readPhysChans(const Node& node, const Enumerations& enumerations, Chassis& chassis,
                   Device& device) {
    node.expectMembers(members::channels);
    const Node prefixNode = node.member("prefix", "the text in front of the channel's number");
    const std::string prefix = readName(prefixNode, nameError);
    if (prefix.back() >= '0' && prefix.back() <= '9') {
        prefixNode.fail("ends in a digit", "the channel's number follows the prefix");
    }
    const Node countNode = node.member("count", "the number of channels");
    const std::uint32_t count = countNode.unsignedNumber(1, mostChannels);
    for (std::uint32_t i = 0; i < count; ++i) {
        Resource& channel = chassis.addPhysChan(device, prefix + std::to_string(i));
        readResource(node, Category::PhysChan, chassis, enumerations, channel);
    }
}

void readNvmemArea(const Node& node, const Enumerations& enumerations, Chassis& chassis,
                   Device& device) {
    node.expectMembers(members::nvmemArea);
    const Node nameNode = node.member("name", "the name of the area");
    const std::string name = readName(nameNode, partNameError);
    if (chassis.findPart(device, name) != nullptr) {
        nameNode.fail("is " + nameNode.shown() +
                          ", and the device has a channel or an area of this name already",
                      "names must differ in more than letter case");
    }
    NvmemArea& area = chassis.addNvmemArea(device, name);
    NvmemMemory::WriteRules rules;
    rules.writable = readWritable(node);
    node.ifPresent("password", [&](const Node& text) { rules.password = text.text(); });
    node.ifPresent("serial_number_wanted", [&](const Node& wanted) {
        rules.wantsSerialNumber = wanted.flag();
        if (rules.wantsSerialNumber && device.properties.find("Dev.SerialNum") == nullptr) {
            wanted.fail("asks for a serial number that is not there",
                        "the device must have a value for Dev.SerialNum");
        }
    });
    area.memory = NvmemMemory(readBytes(node), std::move(rules));
    readResource(node, Category::NvmemArea, chassis, enumerations, area);
}

}  // namespace simulator
