#include "sessions/ComputedProperties.h"

#include "status/Refusal.h"

namespace simulator {

namespace {

struct Subject {
    const Simulator& simulator;
    const Session& session;
    const Resource* resource;

    const Device& device() const { return *resource->device; }
    const NvmemMemory& memory() const { return static_cast<const NvmemArea*>(resource)->memory; }
};

using Value = std::optional<ReadValue>;

struct Entry {
    Category category;
    std::string_view name;
    Value (*read)(const Subject& subject);
};

template <typename Item>
Value scalar(Item item) {
    return ReadValue(Elements(List<Item>{std::move(item)}));
}

template <typename Resources>
Value fullNames(const Resources& resources) {
    List<std::string> names;
    for (const auto& resource : resources) {
        names.push_back(resource->fullName());
    }
    return ReadValue(Elements(std::move(names)));
}

Value deviceNames(const std::vector<Device*>& devices) {
    ReadValue::Names names;
    for (const Device* device : devices) {
        names.push_back(device->name);
    }
    return ReadValue(std::move(names));
}

template <Category category>
Value propertyNames(const Subject& subject) {
    return ReadValue(subject.simulator.chassis->catalogue.names(category));
}

Value ownPropertyNames(const Subject& subject) {
    return ReadValue(subject.resource->properties.ownNames());
}

Value commandNames(const Subject& subject) {
    ReadValue::Names names;
    for (const Command& command : subject.resource->commands) {
        names.push_back(command.name);
    }
    return ReadValue(std::move(names));
}

// Only a chassis has modules, and only a module has a slot.
bool isModule(const Device& device) {
    return device.slot != 0;
}

Value modules(const Subject& subject) {
    constexpr std::int32_t chassisCategory = 1;
    if (subject.device().category != chassisCategory || isModule(subject.device())) {
        return std::nullopt;
    }
    return ReadValue(presentNames(subject.device().modules));
}

Value slotNumber(const Subject& subject) {
    if (!isModule(subject.device())) {
        return std::nullopt;
    }
    return scalar(subject.device().slot);
}

constexpr Entry entries[] = {
    {Category::System, "Sys.Devices",
     [](const Subject& subject) -> Value {
         return ReadValue(subject.simulator.chassis->deviceNames());
     }},
    {Category::System, "Sys.ConfigChangeCount",
     [](const Subject& subject) -> Value {
         return scalar<std::uint64_t>(subject.simulator.chassis->changes);
     }},
    {Category::System, "Sys.SystemProperties", propertyNames<Category::System>},
    {Category::System, "Sys.SessionProperties", propertyNames<Category::Session>},
    {Category::System, "Sys.DeviceProperties", propertyNames<Category::Device>},
    {Category::System, "Sys.PhysChanProperties", propertyNames<Category::PhysChan>},
    {Category::System, "Sys.NVMEMAreaProperties", propertyNames<Category::NvmemArea>},
    {Category::Session, "Session.ReservedDevices",
     [](const Subject& subject) -> Value {
         return deviceNames(subject.simulator.reservations.heldBy(subject.session.handle));
     }},
    {Category::Session, "Session.ConnectedDevices",
     [](const Subject& subject) -> Value { return deviceNames(subject.session.connectedDevices); }},
    {Category::Session, "Session.DefaultDevices",
     [](const Subject& subject) -> Value { return deviceNames(subject.session.defaultDevices); }},
    {Category::Session, "Session.DefaultPhysChans",
     [](const Subject& subject) -> Value { return fullNames(subject.session.defaultPhysChans); }},
    {Category::Session, "Session.DefaultNVMEMAreas",
     [](const Subject& subject) -> Value { return fullNames(subject.session.defaultNvmemAreas); }},
    {Category::Device, "Dev.Name",
     [](const Subject& subject) -> Value { return scalar<std::string>(subject.device().name); }},
    {Category::Device, "Dev.ProductCategory",
     [](const Subject& subject) -> Value {
         return scalar<std::int32_t>(subject.device().category);
     }},
    {Category::Device, "Dev.Modules", modules},
    {Category::Device, "Dev.SlotNum", slotNumber},
    {Category::Device, "Dev.PhysChans",
     [](const Subject& subject) -> Value { return fullNames(subject.device().physChans); }},
    {Category::Device, "Dev.NVMEM.Areas",
     [](const Subject& subject) -> Value { return fullNames(subject.device().nvmemAreas); }},
    {Category::Device, "Dev.Properties", ownPropertyNames},
    {Category::Device, "Dev.Commands", commandNames},
    {Category::PhysChan, "PhysChan.Properties", ownPropertyNames},
    {Category::PhysChan, "PhysChan.Commands", commandNames},
    {Category::NvmemArea, "NVMEMArea.Size",
     [](const Subject& subject) -> Value {
         return scalar<std::uint32_t>(subject.memory().size());
     }},
    {Category::NvmemArea, "NVMEMArea.Writable",
     [](const Subject& subject) -> Value {
         return scalar<std::uint8_t>(subject.memory().writeRules().writable);
     }},
    {Category::NvmemArea, "NVMEMArea.SerialNumWanted",
     [](const Subject& subject) -> Value {
         return scalar<std::uint8_t>(subject.memory().writeRules().wantsSerialNumber);
     }},
    {Category::NvmemArea, "NVMEMArea.PasswordWanted",
     [](const Subject& subject) -> Value {
         return scalar<std::uint8_t>(!subject.memory().writeRules().password.empty());
     }},
    {Category::NvmemArea, "NVMEMArea.PendingChanges",
     [](const Subject& subject) -> Value {
         return scalar<std::uint8_t>(subject.memory().hasPending());
     }},
};

const NameIndex<const Entry*>& entriesByName() {
    static const NameIndex<const Entry*> index = [] {
        NameIndex<const Entry*> made;
        for (const Entry& entry : entries) {
            made.emplace(HashedName(entry.name), &entry);
        }
        return made;
    }();
    return index;
}

std::string joined(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) {
        text += (text.empty() ? "" : ",") + name;
    }
    return text;
}

}  // namespace

Value computedValue(const Simulator& simulator, const Session& session, Category category,
                    const Resource* resource, const HashedName& name) {
    const Entry* entry = findIn(entriesByName(), name);
    return entry != nullptr && entry->category == category
               ? entry->read({simulator, session, resource})
               : std::nullopt;
}

void setDefaultResources(const Resolver& resolver, Session& session, std::string_view property,
                         const std::vector<std::string>& names) {
    const std::string text = joined(names);
    if (property == "Session.DefaultPhysChans") {
        session.defaultPhysChans = distinct(resolver.resources(Kind::PhysChan, text));
    } else if (property == "Session.DefaultNVMEMAreas") {
        session.defaultNvmemAreas = distinct(resolver.resources(Kind::NvmemArea, text));
    } else {
        session.defaultDevices = owners(resolver.resources(Kind::Device, text));
    }
}

}  // namespace simulator
