#include "sessions/Resolver.h"

#include <algorithm>
#include <iterator>
#include <set>

#include "model/NameText.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

template <typename Derived>
std::vector<Resource*> asResources(const std::vector<Derived*>& list) {
    return std::vector<Resource*>(list.begin(), list.end());
}

std::vector<Resource*> present(std::vector<Resource*> resources) {
    for (const Resource* resource : resources) {
        expectPresent(*resource->device, resource->device->absence);
    }
    return resources;
}

}  // namespace

void expectSome(const std::vector<Resource*>& resources) {
    if (resources.empty()) {
        throw Refusal(code::noResources);
    }
}

void expectOne(const std::vector<Resource*>& resources) {
    expectSome(resources);
    if (resources.size() > 1) {
        std::vector<std::string> names;
        for (const Resource* resource : resources) {
            names.push_back(resource->fullName());
        }
        throw Refusal(code::severalResources).usage(tag::resource, names);
    }
}

std::vector<Resource*> distinct(const std::vector<Resource*>& resources) {
    std::set<const Resource*> seen;
    std::vector<Resource*> kept;
    std::copy_if(resources.begin(), resources.end(), std::back_inserter(kept),
                 [&](const Resource* resource) { return seen.insert(resource).second; });
    return kept;
}

std::vector<Device*> owners(const std::vector<Resource*>& resources) {
    std::vector<Device*> devices;
    for (const Resource* resource : resources) {
        if (std::find(devices.begin(), devices.end(), resource->device) == devices.end()) {
            devices.push_back(resource->device);
        }
    }
    return devices;
}

std::vector<Device*> Resolver::reservedDevices() const {
    return reservations.heldBy(session.handle);
}

std::optional<std::vector<Resource*>> Resolver::tokenResources(std::string_view name) const {
    if (name.empty() || name.front() != '$') {
        return std::nullopt;
    }
    if (name == "$ConnectedDevices") {
        return asResources(session.connectedDevices);
    }
    if (name == "$DefaultDevices") {
        return asResources(session.defaultDevices);
    }
    if (name == "$DefaultNVMEMAreas") {
        return session.defaultNvmemAreas;
    }
    if (name == "$DefaultPhysChans") {
        return session.defaultPhysChans;
    }
    if (name == "$ReservedDevices") {
        return asResources(reservedDevices());
    }
    return std::nullopt;
}

Resource& Resolver::named(Kind kind, std::string_view name) const {
    switch (kind) {
        case Kind::PhysChan:
            return chassis.physChan(name);
        case Kind::NvmemArea:
            return chassis.nvmemArea(name);
        default:
            return chassis.device(name);
    }
}

Resource& Resolver::named(std::string_view name) const {
    const std::size_t slash = name.find('/');
    Device& device = chassis.device(name.substr(0, slash));
    if (slash == std::string_view::npos) {
        return device;
    }
    Resource* part = chassis.findPart(device, name.substr(slash + 1));
    return part != nullptr ? *part : chassis.physChan(name);
}

template <typename Find>
std::vector<Resource*> Resolver::collect(std::string_view joined, Find find) const {
    std::vector<Resource*> found;
    forEachName(joined, [&](const std::string& name) {
        if (const auto list = tokenResources(name)) {
            found.insert(found.end(), list->begin(), list->end());
        } else {
            found.push_back(&find(name));
        }
    });
    return found;
}

std::vector<Resource*> Resolver::ofKind(Kind kind, std::string_view joined) const {
    auto found =
        collect(joined, [&](const std::string& name) -> Resource& { return named(kind, name); });
    for (const Resource* resource : found) {
        if (resource->kind != kind) {
            named(kind, resource->fullName());
        }
    }
    return found;
}

std::vector<Resource*> Resolver::resources(Kind kind, std::string_view joined) const {
    return present(ofKind(kind, joined));
}

std::vector<Resource*> Resolver::anyResources(std::string_view joined) const {
    return present(
        collect(joined, [&](const std::string& name) -> Resource& { return named(name); }));
}

Resource* Resolver::singleResource(std::string_view joined) const {
    const auto isSpecial = [](char c) { return c == ',' || c == ':'; };
    if (joined.empty() || joined.front() == '$' ||
        std::any_of(joined.begin(), joined.end(), isSpecial)) {
        return nullptr;
    }
    Resource& found = named(joined);
    expectPresent(*found.device, found.device->absence);
    return &found;
}

std::vector<Resource*> Resolver::mentioned(std::string_view joined) const {
    std::vector<Resource*> found;
    try {
        forEachName(joined, [&](const std::string& name) {
            if (const auto list = tokenResources(name)) {
                found.insert(found.end(), list->begin(), list->end());
            } else if (Resource* resource = chassis.find(name)) {
                found.push_back(resource);
            }
        });
    } catch (const Refusal&) {
        // The call itself is refused for this range.
    }
    return found;
}

std::vector<Device*> Resolver::devices(std::string_view joined) const {
    const auto found = resources(Kind::Device, joined);
    expectSome(found);
    return owners(found);
}

std::vector<Device*> Resolver::devicesToConnect(std::string_view joined) const {
    const auto found = owners(ofKind(Kind::Device, joined));
    for (const Device* device : found) {
        if (device->absence == Absence::Removed) {
            expectPresent(*device, device->absence);
        }
    }
    if (found.empty()) {
        throw Refusal(code::noResources);
    }
    return found;
}

Device& Resolver::oneDevice(std::string_view joined) const {
    const auto found = resources(Kind::Device, joined);
    expectOne(found);
    return *found.front()->device;
}

NvmemArea& Resolver::oneNvmemArea(std::string_view joined) const {
    const auto found = resources(Kind::NvmemArea, joined);
    expectOne(found);
    return static_cast<NvmemArea&>(*found.front());
}

}  // namespace simulator
