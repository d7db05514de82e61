#include "state/Restoring.h"

#include <cstdio>

#include "model/NameText.h"

namespace simulator {

namespace {

using Names = std::map<Device*, std::string>;

class Restorer {
  public:
    Restorer(const char* folder, Chassis& chassis) : folder(folder), chassis(chassis) {}

    void take(const StateEntry& entry);
    // Gives the devices their names, when everything else is found by the described ones.
    void rename();

  private:
    void takeOfSystem(const StateEntry& entry);
    void takeProperty(const StateEntry& entry, PropertyStore& properties);
    void takeContent(const StateEntry& entry, Resource& resource);
    void takeName(const StateEntry& entry, Resource& resource);
    // Drops one name that cannot be restored. Returns false when there is none.
    bool dropTakenName();
    void complain(const std::string& about, const char* reason) const;

    const char* folder;
    Chassis& chassis;
    Names names;
};

void Restorer::complain(const std::string& about, const char* reason) const {
    std::fprintf(stderr, "qitrmcapi: %s: what is kept of %s is not used: %s\n", folder,
                 about.c_str(), reason);
}

std::string titleOf(const StateEntry& entry) {
    const char* joint = entry.resource.empty() || entry.item.empty() ? "" : " ";
    return entry.resource + joint + entry.item;
}

void Restorer::takeProperty(const StateEntry& entry, PropertyStore& properties) {
    Property* property = properties.find(entry.item);
    if (property == nullptr || !property->definition->lasting) {
        return;
    }
    const PropertyDefinition& definition = *property->definition;
    if (entry.type != definition.type ||
        (!isArray(definition.type) && elementCount(entry.value) != 1)) {
        complain(titleOf(entry), "the property has another type");
    } else if (definition.firstWithoutItem(entry.value) ||
               definition.firstOutOfRange(entry.value)) {
        complain(titleOf(entry), "the property cannot have this value");
    } else {
        property->value = entry.value;
    }
}

void Restorer::takeContent(const StateEntry& entry, Resource& resource) {
    if (resource.kind != Kind::NvmemArea) {
        return;
    }
    NvmemMemory& memory = static_cast<NvmemArea&>(resource).memory;
    const auto* bytes = std::get_if<List<std::uint8_t>>(&entry.value);
    if (bytes == nullptr || bytes->size() != memory.size()) {
        complain(titleOf(entry), "the area has another size");
    } else {
        memory.restore(*bytes);
    }
}

void Restorer::takeName(const StateEntry& entry, Resource& resource) {
    const auto* name = std::get_if<List<std::string>>(&entry.value);
    if (name == nullptr || name->size() != 1 || !nameError(name->front()).empty()) {
        complain(titleOf(entry), "it is no name");
    } else {
        names[resource.device] = name->front();
    }
}

void Restorer::takeOfSystem(const StateEntry& entry) {
    const auto* count = std::get_if<List<std::uint64_t>>(&entry.value);
    if (entry.item == changesItem && count != nullptr && count->size() == 1) {
        chassis.changes = count->front();
    } else {
        takeProperty(entry, chassis.systemProperties);
    }
}

void Restorer::take(const StateEntry& entry) {
    if (entry.resource.empty()) {
        takeOfSystem(entry);
        return;
    }
    Resource* resource = chassis.find(entry.resource);
    if (resource == nullptr) {
        return;
    }
    if (entry.item == contentItem) {
        takeContent(entry, *resource);
    } else if (entry.item == nameItem && resource->kind == Kind::Device) {
        takeName(entry, *resource);
    } else {
        takeProperty(entry, resource->properties);
    }
}

bool Restorer::dropTakenName() {
    std::map<std::string, Device*> owners;
    for (const auto& device : chassis.devices()) {
        const auto kept = names.find(device.get());
        const std::string& name = kept == names.end() ? device->name : kept->second;
        const auto [place, isFree] = owners.emplace(foldName(name), device.get());
        if (!isFree) {
            Device* const loser = kept == names.end() ? place->second : device.get();
            complain(loser->name + " " + nameItem, "another device has this name");
            names.erase(loser);
            return true;
        }
    }
    return false;
}

void Restorer::rename() {
    while (dropTakenName()) {
    }
    chassis.rename(names);
}

}  // namespace

void restore(const std::map<std::string, StateEntry>& entries, const char* folder,
             Chassis& chassis) {
    Restorer restorer(folder, chassis);
    for (const auto& [key, entry] : entries) {
        restorer.take(entry);
    }
    restorer.rename();
}

}  // namespace simulator
