#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "lending/SharedTexts.h"
#include "model/Commands.h"
#include "model/NameIndex.h"
#include "model/NameText.h"
#include "model/Nvmem.h"
#include "model/Properties.h"
#include "model/Registers.h"

namespace simulator {

enum class Kind { Device, PhysChan, NvmemArea };

struct Device;

// Why a device does not answer at the moment.
enum class Absence { None, ConnectionLost, Removed };

// Something that clients name. Resources exist as long as the chassis; their addresses identify
// them, while their names may change.
struct Resource {
    Resource(Kind kind, const std::string& name, Device& device)
        : kind(kind), name(name), foldedName(foldName(name)), device(&device) {}
    Resource(const Resource&) = delete;
    Resource& operator=(const Resource&) = delete;

    // "Mod1" for a device, "Mod1/ch0" for what belongs to one.
    std::string fullName() const;
    // The same with the name that the description gives the device, which never changes.
    std::string describedName() const;
    // Returns null when there is no such command.
    Command* command(std::string_view commandName);

    Kind kind;
    // The part of the name after the slash, or the whole name of a device.
    std::string name;
    // The name for look-ups.
    std::string foldedName;
    // The device that this belongs to; a device belongs to itself.
    Device* device;
    PropertyStore properties;
    // In the order of the description.
    std::vector<Command> commands;
    // While a command takes its time.
    bool busy = false;
};

struct NvmemArea : Resource {
    NvmemArea(const std::string& name, Device& device) : Resource(Kind::NvmemArea, name, device) {}

    NvmemMemory memory;
};

struct Device : Resource {
    Device(const std::string& name, std::size_t place)
        : Resource(Kind::Device, name, *this), firstName(name), place(place) {}

    // The name in the description.
    const std::string firstName;
    // The index in the list of all devices.
    const std::size_t place;
    std::uint32_t slot = 0;
    std::int32_t category = 0;
    std::vector<std::unique_ptr<Resource>> physChans;
    std::vector<std::unique_ptr<NvmemArea>> nvmemAreas;
    // The modules in the slots of a chassis device; owned by the Chassis.
    std::vector<Device*> modules;
    // The channels and areas by their folded names, without the device's.
    NameIndex<Resource*> parts;
    Registers registers;
    // How long it takes to connect, and whether the device answers then.
    double connectSeconds = 0.0;
    bool reachable = true;
    // While this is not none, calls that name the device or its parts are refused. Set by the
    // Chassis.
    Absence absence = Absence::None;

    // Calls visit(Resource&) for the device itself and all its parts.
    template <typename Visit>
    void forEachResource(Visit visit) {
        visit(static_cast<Resource&>(*this));
        for (const auto& channel : physChans) {
            visit(*channel);
        }
        for (const auto& area : nvmemAreas) {
            visit(static_cast<Resource&>(*area));
        }
    }
    // Puts everything into the state after power-on, except for what lasts: the names, the
    // lasting properties and the committed content of the NVMEM areas.
    void reset();
    // Discards what a session wrote to the device and its parts and did not commit.
    void dropPending(nQITRMCAPI100_Session session);
    // Discards everything that was written to the device and its parts and not committed.
    void dropAllPending() noexcept;
};

// The names of the devices that are not removed.
template <typename Devices>
std::vector<std::string_view> presentNames(const Devices& devices) {
    std::vector<std::string_view> names;
    names.reserve(devices.size());
    for (const auto& device : devices) {
        if (device->absence != Absence::Removed) {
            names.push_back(device->name);
        }
    }
    return names;
}

// Refuses with connectionLost or deviceRemoved, unless `absence` is none.
void expectPresent(const Device& device, Absence absence);

// All resources of the system. Names are looked up without regard to letter case.
class Chassis {
  public:
    // Appends a device. The name must be free.
    Device& addDevice(const std::string& name);
    // Add a part to a device. The name must be free on that device.
    Resource& addPhysChan(Device& device, const std::string& name);
    NvmemArea& addNvmemArea(Device& device, const std::string& name);
    // Gives a device a name that no other device has. keep() is called when nothing else can fail
    // any more; if it throws, nothing has changed.
    void rename(Device& device, const std::string& newName, const std::function<void()>& keep);
    // Gives devices names, after which no two have the same. Does not count as a change.
    void rename(const std::map<Device*, std::string>& names);

    void setAbsence(Device& device, Absence absence) noexcept;

    // Return null when there is no such resource.
    Device* findDevice(std::string_view name) const;
    Resource* findPart(const Device& device, std::string_view name) const;
    // Find a resource of any kind by its full name, or by the one that it has in the description.
    Resource* find(std::string_view fullName) const;
    Resource* findDescribed(std::string_view fullName) const;

    // Find a resource of one kind, or refuse with a status of that kind.
    Device& device(std::string_view name) const;
    Resource& physChan(std::string_view fullName) const;
    NvmemArea& nvmemArea(std::string_view fullName) const;

    const std::vector<std::unique_ptr<Device>>& devices() const { return all; }
    // The names of the devices that are not removed.
    const SharedTexts& deviceNames() const {
        return namesOfPresent.get([&] { return presentNames(all); });
    }

    // The handle of the first session that is opened.
    std::uint32_t firstSessionHandle = 1;
    // How often a name has changed.
    std::uint64_t changes = 0;
    // Those that the description gives.
    Enumerations enumerations;
    Catalogue catalogue;
    PropertyStore systemProperties;
    // The properties of a new session.
    PropertyStore sessionProperties;

  private:
    std::vector<std::unique_ptr<Device>> all;
    // By their folded names.
    NameIndex<Device*> byName;
    TextsOnDemand namesOfPresent;
};

}  // namespace simulator
