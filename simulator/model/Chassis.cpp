#include "model/Chassis.h"

#include "status/Refusal.h"

namespace simulator {

std::string Resource::fullName() const {
    return kind == Kind::Device ? name : device->name + "/" + name;
}

std::string Resource::describedName() const {
    return kind == Kind::Device ? device->firstName : device->firstName + "/" + name;
}

Command* Resource::command(std::string_view commandName) {
    for (Command& command : commands) {
        if (command.name == commandName) {
            return &command;
        }
    }
    return nullptr;
}

void Device::reset() {
    PropertyChanges changes;
    forEachResource([&](Resource& resource) { changes.addReset(resource); });
    changes.carryOut();
    for (const auto& area : nvmemAreas) {
        area->memory.drop();
    }
    registers.reset();
}

void Device::dropPending(nQITRMCAPI100_Session session) {
    forEachResource([&](Resource& resource) { resource.properties.dropPending(session); });
    for (const auto& area : nvmemAreas) {
        area->memory.dropPending(session);
    }
}

void Device::dropAllPending() noexcept {
    forEachResource([](Resource& resource) { resource.properties.dropAllPending(); });
    for (const auto& area : nvmemAreas) {
        area->memory.drop();
    }
}

void expectPresent(const Device& device, Absence absence) {
    if (absence == Absence::Removed) {
        throw Refusal(code::deviceRemoved).usage(tag::device, device.name);
    }
    if (absence == Absence::ConnectionLost) {
        throw Refusal(code::connectionLost).usage(tag::device, device.name);
    }
}

Device& Chassis::addDevice(const std::string& name) {
    all.push_back(std::make_unique<Device>(name, all.size()));
    Device& added = *all.back();
    byName.emplace(HashedName(added.foldedName), &added);
    namesOfPresent.discard();
    return added;
}

Resource& Chassis::addPhysChan(Device& device, const std::string& name) {
    device.physChans.push_back(std::make_unique<Resource>(Kind::PhysChan, name, device));
    Resource& added = *device.physChans.back();
    device.parts.emplace(HashedName(added.foldedName), &added);
    return added;
}

NvmemArea& Chassis::addNvmemArea(Device& device, const std::string& name) {
    device.nvmemAreas.push_back(std::make_unique<NvmemArea>(name, device));
    NvmemArea& added = *device.nvmemAreas.back();
    device.parts.emplace(HashedName(added.foldedName), &added);
    return added;
}

void Chassis::rename(Device& device, const std::string& newName,
                     const std::function<void()>& keep) {
    std::string name = newName;
    std::string folded = foldName(newName);
    keep();
    // An entry that is taken out and put in again needs no memory.
    auto entry = byName.extract(HashedName(device.foldedName));
    device.name.swap(name);
    device.foldedName.swap(folded);
    entry.key() = HashedName(device.foldedName);
    byName.insert(std::move(entry));
    namesOfPresent.discard();
    ++changes;
}

void Chassis::rename(const std::map<Device*, std::string>& names) {
    namesOfPresent.discard();
    for (const auto& [device, name] : names) {
        device->name = name;
        device->foldedName = foldName(name);
    }
    byName.clear();
    for (const auto& device : all) {
        byName.emplace(HashedName(device->foldedName), device.get());
    }
}

void Chassis::setAbsence(Device& device, Absence absence) noexcept {
    device.absence = absence;
    namesOfPresent.discard();
}

Device* Chassis::findDevice(std::string_view name) const {
    return findIn(byName, HashedName(FoldedName(name).text()));
}

Resource* Chassis::findPart(const Device& device, std::string_view name) const {
    return findIn(device.parts, HashedName(FoldedName(name).text()));
}

Resource* Chassis::find(std::string_view fullName) const {
    const std::size_t slash = fullName.find('/');
    Device* device = findDevice(fullName.substr(0, slash));
    if (device == nullptr || slash == std::string_view::npos) {
        return device;
    }
    return findPart(*device, fullName.substr(slash + 1));
}

Resource* Chassis::findDescribed(std::string_view fullName) const {
    const std::size_t slash = fullName.find('/');
    const std::string folded = foldName(fullName.substr(0, slash));
    for (const auto& device : all) {
        if (foldName(device->firstName) == folded) {
            return slash == std::string_view::npos ? device.get()
                                                   : findPart(*device, fullName.substr(slash + 1));
        }
    }
    return nullptr;
}

Device& Chassis::device(std::string_view name) const {
    Device* found = findDevice(name);
    if (found == nullptr) {
        throw Refusal(code::unknownDevice).usage(tag::requestedValue, name);
    }
    return *found;
}

Resource& Chassis::physChan(std::string_view fullName) const {
    Resource* found = find(fullName);
    if (found == nullptr || found->kind != Kind::PhysChan) {
        throw Refusal(code::unknownPhysChan).usage(tag::requestedValue, fullName);
    }
    return *found;
}

NvmemArea& Chassis::nvmemArea(std::string_view fullName) const {
    Resource* found = find(fullName);
    if (found == nullptr || found->kind != Kind::NvmemArea) {
        throw Refusal(code::unknownNvmemArea).usage(tag::requestedValue, fullName);
    }
    return static_cast<NvmemArea&>(*found);
}

}  // namespace simulator
