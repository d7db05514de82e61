#include "ChassisFile.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

#include "Description.h"
#include "EmbeddedTexts.h"
#include "NameText.h"
#include "Refusal.h"

namespace simulator {

namespace {

constexpr int32_t chassisCategory = 1;
constexpr uint32_t mostSlots = 64;
constexpr uint32_t mostChannels = 1024;

std::string newName(const Node& node, std::string (*faultOf)(std::string_view)) {
    const std::string name = node.text();
    const std::string fault = faultOf(name);
    if (!fault.empty()) {
        node.fail("is not a name", fault);
    }
    return name;
}

void readChannels(const Node& node, Chassis& chassis, Device& device) {
    node.expectMembers({"prefix", "count"});
    const Node prefixNode = node.member("prefix", "the text in front of the channel's number");
    const std::string prefix = newName(prefixNode, nameFault);
    if (prefix.back() >= '0' && prefix.back() <= '9') {
        prefixNode.fail("ends in a digit", "the channel's number follows the prefix");
    }
    const Node countNode = node.member("count", "the number of channels");
    const uint32_t count = countNode.unsignedNumber(1, mostChannels);
    for (uint32_t i = 0; i < count; ++i) {
        chassis.addPart(device, Kind::physChan, prefix + std::to_string(i));
    }
}

void readArea(const Node& node, Chassis& chassis, Device& device) {
    node.expectMembers({"name"});
    const Node nameNode = node.member("name", "the name of the area");
    const std::string name = newName(nameNode, partNameFault);
    if (chassis.findPart(device, name) != nullptr) {
        nameNode.fail("is the name of two parts of the device", "names must differ");
    }
    chassis.addPart(device, Kind::nvmemArea, name);
}

enum class Place { system, slot };

Device& readDevice(const Node& node, Place place, Chassis& chassis);

void readModules(const Node& node, Chassis& chassis, Device& owner) {
    node.forEachElement([&](const Node& element) {
        Device& module = readDevice(element, Place::slot, chassis);
        for (const Device* other : owner.modules) {
            if (other->slot == module.slot) {
                element.fail("stands in a slot that is taken", "slots hold one module each");
            }
        }
        owner.modules.push_back(&module);
    });
}

Device& readDevice(const Node& node, Place place, Chassis& chassis) {
    node.expectMembers({"name", "category", "slot", "modules", "channels", "nvmem_areas"});
    const Node nameNode = node.member("name", "the name of the device");
    const std::string name = newName(nameNode, nameFault);
    if (chassis.findDevice(name) != nullptr) {
        nameNode.fail("is the name of two devices", "names must differ in more than letter case");
    }
    Device& device = chassis.addDevice(name);
    device.category = node.member("category", "the product category").signedNumber();
    if (place == Place::slot) {
        device.slot = node.member("slot", "the number of the slot").unsignedNumber(1, mostSlots);
    } else if (node.has("slot")) {
        node.member("slot", "").fail("belongs to no chassis", "only modules have a slot");
    }
    if (node.has("channels")) {
        readChannels(node.member("channels", ""), chassis, device);
    }
    if (node.has("nvmem_areas")) {
        node.member("nvmem_areas", "").forEachElement([&](const Node& element) {
            readArea(element, chassis, device);
        });
    }
    if (node.has("modules")) {
        const Node modules = node.member("modules", "");
        if (device.category != chassisCategory || place == Place::slot) {
            modules.fail("belongs to a device that is no chassis",
                         "only a device of category 1 outside of a slot has modules");
        }
        readModules(modules, chassis, device);
    }
    return device;
}

std::string readFile(const char* path) {
    std::ifstream file(path, std::ios::binary);
    std::ostringstream content;
    if (file) {
        content << file.rdbuf();
    }
    if (!file || !content) {
        throw DescriptionFault{"", std::string("cannot be read: ") + std::strerror(errno),
                               "QITRMC_SIM_CHASSIS must name a readable file"};
    }
    return content.str();
}

std::vector<std::string> memberNames(const Node& node) {
    std::vector<std::string> names;
    node.forEachMember([&](const std::string& name, const Node&) { names.push_back(name); });
    return names;
}

}  // namespace

std::unique_ptr<Chassis> parseChassis(std::string_view text) {
    JsonDocument document;
    parseDescription(text, document);
    const Node root(document);
    root.expectMembers({"first_session_handle", "devices"});
    auto chassis = std::make_unique<Chassis>();
    if (root.has("first_session_handle")) {
        chassis->firstSessionHandle =
            root.member("first_session_handle", "").unsignedNumber(1, UINT32_MAX);
    }
    root.member("devices", "an array of devices").forEachElement([&](const Node& element) {
        readDevice(element, Place::system, *chassis);
    });
    return chassis;
}

std::unique_ptr<Chassis> loadChassis() {
    const char* path = std::getenv("QITRMC_SIM_CHASSIS");
    const bool fromFile = path != nullptr && *path != '\0';
    try {
        return parseChassis(fromFile ? readFile(path) : std::string(embedded::bench));
    } catch (const DescriptionFault& fault) {
        const std::string name = fromFile ? path : "(built-in chassis)";
        const std::string place = fault.pointer.empty() ? "" : fault.pointer + " ";
        std::fprintf(stderr, "qitrmcapi: %s: %s%s; %s\n", name.c_str(), place.c_str(),
                     fault.wrong.c_str(), fault.right.c_str());
        throw Refusal(code::chassisNotLoaded)
            .usage(tag::fileName, name)
            .usage(tag::jsonPointer, fault.pointer)
            .usage(tag::explanation, fault.wrong + "; " + fault.right);
    }
}

Catalogue loadCatalogue() {
    JsonDocument document;
    parseDescription(embedded::catalogue, document);
    const Node root(document);
    Catalogue catalogue;
    catalogue.system = memberNames(root.member("system", "properties"));
    catalogue.session = memberNames(root.member("session", "properties"));
    catalogue.device = memberNames(root.member("device", "properties"));
    catalogue.physChan = memberNames(root.member("phys_chan", "properties"));
    catalogue.nvmemArea = memberNames(root.member("nvmem_area", "properties"));
    return catalogue;
}

}  // namespace simulator
