#include "Chassis.h"

#include "NameText.h"
#include "Refusal.h"

namespace simulator {

std::string Resource::fullName() const {
    return kind == Kind::device ? name : device->name + "/" + name;
}

Device& Chassis::addDevice(const std::string& name) {
    all.push_back(std::make_unique<Device>(name));
    byName.emplace(foldName(name), all.back().get());
    return *all.back();
}

Resource& Chassis::addPart(Device& device, Kind kind, const std::string& name) {
    auto& parts = kind == Kind::physChan ? device.physChans : device.nvmemAreas;
    parts.push_back(std::make_unique<Resource>(kind, name, device));
    device.parts.emplace(foldName(name), parts.back().get());
    return *parts.back();
}

Device* Chassis::findDevice(std::string_view name) const {
    const auto found = byName.find(foldName(name));
    return found == byName.end() ? nullptr : found->second;
}

Resource* Chassis::findPart(const Device& device, std::string_view name) const {
    const auto found = device.parts.find(foldName(name));
    return found == device.parts.end() ? nullptr : found->second;
}

Resource* Chassis::find(std::string_view fullName) const {
    const size_t slash = fullName.find('/');
    Device* device = findDevice(fullName.substr(0, slash));
    if (device == nullptr || slash == std::string_view::npos) {
        return device;
    }
    return findPart(*device, fullName.substr(slash + 1));
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
    if (found == nullptr || found->kind != Kind::physChan) {
        throw Refusal(code::unknownPhysChan).usage(tag::requestedValue, fullName);
    }
    return *found;
}

Resource& Chassis::nvmemArea(std::string_view fullName) const {
    Resource* found = find(fullName);
    if (found == nullptr || found->kind != Kind::nvmemArea) {
        throw Refusal(code::unknownNvmemArea).usage(tag::requestedValue, fullName);
    }
    return *found;
}

}  // namespace simulator
