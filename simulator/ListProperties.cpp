#include "ListProperties.h"

#include "Refusal.h"

namespace simulator {

namespace {

template <typename List>
std::vector<std::string> namesOf(const List& resources) {
    std::vector<std::string> names;
    for (const auto& resource : resources) {
        names.push_back(resource->fullName());
    }
    return names;
}

[[noreturn]] void refuse(std::string_view property) {
    throw Refusal(code::unknownProperty).usage(tag::propertyName, property);
}

}  // namespace

std::vector<std::string> systemList(const Simulator& simulator, std::string_view property) {
    const Catalogue& catalogue = simulator.catalogue;
    if (property == "Sys.Devices") {
        return namesOf(simulator.chassis->devices());
    }
    if (property == "Sys.SystemProperties") {
        return catalogue.system;
    }
    if (property == "Sys.SessionProperties") {
        return catalogue.session;
    }
    if (property == "Sys.DeviceProperties") {
        return catalogue.device;
    }
    if (property == "Sys.PhysChanProperties") {
        return catalogue.physChan;
    }
    if (property == "Sys.NVMEMAreaProperties") {
        return catalogue.nvmemArea;
    }
    refuse(property);
}

std::vector<std::string> sessionList(const Simulator& simulator, const Session& session,
                                     std::string_view property) {
    if (property == "Session.ReservedDevices") {
        return namesOf(simulator.resolver(session).reservedDevices());
    }
    if (property == "Session.ConnectedDevices") {
        return namesOf(session.connectedDevices);
    }
    if (property == "Session.DefaultDevices") {
        return namesOf(session.defaultDevices);
    }
    if (property == "Session.DefaultPhysChans") {
        return namesOf(session.defaultPhysChans);
    }
    if (property == "Session.DefaultNVMEMAreas") {
        return namesOf(session.defaultNvmemAreas);
    }
    refuse(property);
}

std::vector<std::string> resourceList(const Resource& resource, std::string_view property) {
    if (resource.kind == Kind::device && property == "Dev.PhysChans") {
        return namesOf(resource.device->physChans);
    }
    if (resource.kind == Kind::device && property == "Dev.NVMEM.Areas") {
        return namesOf(resource.device->nvmemAreas);
    }
    refuse(property);
}

}  // namespace simulator
