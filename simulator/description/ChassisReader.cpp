#include "description/ChassisReader.h"

#include <cstdlib>

#include "EmbeddedTexts.h"
#include "Members.h"
#include "description/Description.h"
#include "description/ErrorReport.h"
#include "description/LiveReader.h"
#include "description/PartsReader.h"
#include "description/PropertyReader.h"
#include "description/RegisterReader.h"
#include "description/TextFile.h"
#include "model/NameText.h"

namespace simulator {

namespace {

constexpr std::int32_t chassisCategory = 1;
constexpr std::uint32_t mostSlots = 64;

enum class Place { System, Slot };

// Reads the devices of one description.
class DeviceReader {
  public:
    DeviceReader(Chassis& chassis, const Enumerations& enumerations)
        : chassis(chassis), enumerations(enumerations) {}

    Device& read(const Node& node, Place place);

  private:
    Device& addDevice(const Node& node);
    void readSlot(const Node& node, Place place, Device& device);
    void readModules(const Node& node, Device& owner);

    Chassis& chassis;
    const Enumerations& enumerations;
};

Device& DeviceReader::addDevice(const Node& node) {
    const Node nameNode = node.member("name", "the name of the device");
    const std::string name = readName(nameNode, nameError);
    if (const Device* other = chassis.findDevice(name)) {
        nameNode.fail(
            "is " + nameNode.shown() + ", and there is a device \"" + other->name + "\" already",
            "names must differ in more than letter case");
    }
    return chassis.addDevice(name);
}

void DeviceReader::readSlot(const Node& node, Place place, Device& device) {
    if (place == Place::Slot) {
        device.slot = node.member("slot", "the number of the slot").unsignedNumber(1, mostSlots);
    } else if (node.has("slot")) {
        node.member("slot", "").fail("belongs to no chassis", "only modules have a slot");
    }
}

void DeviceReader::readModules(const Node& node, Device& owner) {
    node.forEachElement([&](const Node& element) {
        Device& module = read(element, Place::Slot);
        for (const Device* other : owner.modules) {
            if (other->slot == module.slot) {
                element.member("slot", "")
                    .fail("is the slot of \"" + other->name + "\" already",
                          "slots hold one module each");
            }
        }
        owner.modules.push_back(&module);
    });
}

Device& DeviceReader::read(const Node& node, Place place) {
    node.expectMembers(members::device);
    Device& device = addDevice(node);
    device.category = node.member("category", "the product category").signedNumber();
    readSlot(node, place, device);
    node.ifPresent("connect_seconds",
                   [&](const Node& time) { device.connectSeconds = time.seconds(); });
    node.ifPresent("reachable", [&](const Node& flag) { device.reachable = flag.flag(); });
    readResource(node, Category::Device, chassis, enumerations, device);
    node.ifPresent("channels", [&](const Node& channels) {
        readPhysChans(channels, enumerations, chassis, device);
    });
    node.ifPresent("nvmem_areas", [&](const Node& areas) {
        areas.forEachElement(
            [&](const Node& element) { readNvmemArea(element, enumerations, chassis, device); });
    });
    node.ifPresent("registers", [&](const Node& blocks) {
        blocks.forEachElement(
            [&](const Node& block) { readRegisterBlock(block, chassis, device); });
    });
    node.ifPresent("modules", [&](const Node& modules) {
        if (device.category != chassisCategory || place == Place::Slot) {
            modules.fail("belongs to a device that is no chassis",
                         "only a device of category 1 outside of a slot has modules");
        }
        readModules(modules, device);
    });
    return device;
}

void readBuiltInCatalogue(Catalogue& catalogue) {
    JsonDocument document;
    parseDescription(embedded::catalogue, document);
    readCatalogue(Node(document), {}, Origin::Driver, catalogue);
}

void fillFrom(const Node& root, const char* member, Category category, const Catalogue& catalogue,
              PropertyStore& store) {
    root.ifPresent(member,
                   [&](const Node& values) { fillStore(category, catalogue, &values, store); });
    fillStore(category, catalogue, nullptr, store);
}

}  // namespace

DescribedChassis parseChassis(std::string_view text) {
    JsonDocument document;
    parseDescription(text, document);
    const Node root(document);
    root.expectMembers(members::chassis);
    root.ifPresent("$schema", [](const Node& schema) { schema.text(); });
    DescribedChassis described{std::make_unique<Chassis>(), {}};
    Chassis* const chassis = described.chassis.get();
    root.ifPresent("first_session_handle", [&](const Node& handle) {
        chassis->firstSessionHandle = handle.unsignedNumber(1, UINT32_MAX);
    });
    root.ifPresent("seed", [&](const Node& seed) {
        seed.expect(seed.json().IsUint64(), "a whole number from 0 to 18446744073709551615");
        described.motions.seed = seed.json().GetUint64();
    });
    Enumerations& enumerations = chassis->enumerations;
    root.ifPresent("enums", [&](const Node& node) { enumerations = readEnumerations(node); });
    readBuiltInCatalogue(chassis->catalogue);
    root.ifPresent("driver_properties", [&](const Node& node) {
        readCatalogue(node, enumerations, Origin::File, chassis->catalogue);
    });
    fillFrom(root, "system_values", Category::System, chassis->catalogue,
             chassis->systemProperties);
    fillFrom(root, "session_values", Category::Session, chassis->catalogue,
             chassis->sessionProperties);
    DeviceReader reader(*chassis, enumerations);
    root.member("devices", "an array of devices").forEachElement([&](const Node& element) {
        reader.read(element, Place::System);
    });
    readMotions(root, *chassis, described.motions);
    return described;
}

DescribedChassis loadChassis() {
    const char* path = std::getenv("QITRMC_SIM_CHASSIS");
    const bool fromFile = path != nullptr && *path != '\0';
    try {
        return parseChassis(
            fromFile ? readTextFile(path, "QITRMC_SIM_CHASSIS must name a readable file").text
                     : std::string(embedded::bench));
    } catch (const DescriptionError& fault) {
        refuseStart(fromFile ? path : "(built-in chassis)", fault);
    }
}

}  // namespace simulator
