#include <algorithm>

#include "entries/Entry.h"

using namespace simulator;

namespace {

void expectBytes(const std::uint8_t* bytes, std::uint32_t size, const char* argument) {
    if (bytes == nullptr && size != 0) {
        throw Refusal(code::missingArgument).usage(tag::argument, argument);
    }
}

std::string serialNumber(const Device& device) {
    const Property* property = device.properties.find("Dev.SerialNum");
    return property != nullptr ? firstText(property->value) : std::string();
}

// The areas that are named, and all areas of the devices that are named.
std::vector<NvmemArea*> areasOf(const Resolver& resolver, std::string_view resources) {
    const auto found = resolver.anyResources(resources);
    expectSome(found);
    std::vector<NvmemArea*> areas;
    for (Resource* resource : found) {
        if (resource->kind == Kind::NvmemArea) {
            areas.push_back(static_cast<NvmemArea*>(resource));
        } else if (resource->kind == Kind::Device) {
            for (const auto& area : resource->device->nvmemAreas) {
                areas.push_back(area.get());
            }
        } else {
            throw Refusal(code::unknownNvmemArea).usage(tag::requestedValue, resource->fullName());
        }
    }
    return areas;
}

}  // namespace

void nQITRMCAPI100_getNvmemBytes(nQITRMCAPI100_Session session, const char* nvmemArea,
                                 std::uint32_t address, std::uint8_t* buffer, std::uint32_t size,
                                 qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("nvmemArea", nvmemArea)
            .in("address", address)
            .out("buffer", buffer, size);
    };
    withSharedSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        const NvmemArea& area =
            simulator.resolver(owner).oneNvmemArea(required(nvmemArea, "nvmemArea"));
        expectBytes(buffer, size, "buffer");
        area.memory.read(address, buffer, size);
    });
}

void nQITRMCAPI100_setNvmemBytes(nQITRMCAPI100_Session session, const char* nvmemArea,
                                 std::uint32_t address, const std::uint8_t* bytes,
                                 std::uint32_t size, const char* serialNumberGiven,
                                 const char* password, qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("nvmemArea", nvmemArea)
            .in("address", address)
            .in("bytes", bytes, size)
            .in("serialNumber", serialNumberGiven)
            .in("password", password);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        NvmemArea& area = simulator.resolver(owner).oneNvmemArea(required(nvmemArea, "nvmemArea"));
        expectBytes(bytes, size, "bytes");
        simulator.reservations.expectWritable(session, *area.device);
        area.memory.unlock(required(serialNumberGiven, "serialNumber"), serialNumber(*area.device),
                           required(password, "password"));
        owner.writtenDevices.insert(area.device);
        area.memory.write(session, address, bytes, size);
    });
}

void nQITRMCAPI100_commitNvmemGeneric(nQITRMCAPI100_Session session, const char* resources,
                                      qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("resources", resources);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        const auto areas = areasOf(simulator.resolver(owner), required(resources, "resources"));
        for (const NvmemArea* area : areas) {
            simulator.reservations.expectWritable(session, *area->device);
        }
        Change change = simulator.lasting.change();
        for (const NvmemArea* area : areas) {
            change.content(*area);
        }
        simulator.lasting.keep(change);
        for (NvmemArea* area : areas) {
            area->memory.commit();
        }
    });
}
