// What the simulator reports for the panel of the development server.

#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

#include <shared_mutex>

#include "entries/Driver.h"
#include "lending/Lending.h"
#include "status/Refusal.h"

using namespace simulator;

namespace {

using Writer = rapidjson::Writer<rapidjson::StringBuffer>;

void writeMember(Writer& writer, const char* name, const std::string& text) {
    if (!text.empty()) {
        writer.Key(name);
        writer.String(text);
    }
}

void writeMember(Writer& writer, const char* name, std::uint32_t number) {
    writer.Key(name);
    writer.Uint(number);
}

const char* stateOf(const Device& device) {
    switch (device.absence) {
        case Absence::None:
            return "present";
        case Absence::ConnectionLost:
            return "connection_lost";
        case Absence::Removed:
            return "pulled";
    }
    return "";
}

void writeRegisters(Writer& writer, const Registers& registers) {
    writer.Key("registers");
    writer.StartArray();
    for (const RegisterBlock& block : registers.all()) {
        writer.StartObject();
        writeMember(writer, "address", block.address);
        writeMember(writer, "size", block.size());
        if (block.width != 0) {
            writeMember(writer, "width", 8 * block.width);
        }
        writeMember(writer, "name", block.name);
        writeMember(writer, "description", block.description);
        writer.EndObject();
    }
    writer.EndArray();
}

// Null for a device that is not in a slot.
const Device* chassisOf(const Chassis& chassis, const Device& module) {
    for (const auto& device : chassis.devices()) {
        for (const Device* other : device->modules) {
            if (other == &module) {
                return device.get();
            }
        }
    }
    return nullptr;
}

void writeDevice(Writer& writer, const Chassis& chassis, const Device& device) {
    writer.StartObject();
    writeMember(writer, "name", device.name);
    writeMember(writer, "state", std::string(stateOf(device)));
    const Property* product = device.properties.find("Dev.ProductName");
    writeMember(writer, "product", product == nullptr ? "" : firstText(product->value));
    if (const Device* rack = chassisOf(chassis, device)) {
        writeMember(writer, "slot", device.slot);
        writeMember(writer, "chassis", rack->name);
    }
    writeRegisters(writer, device.registers);
    writer.EndObject();
}

std::string describeDevices(Driver& driver) {
    Simulator& simulator = driver.simulator;
    rapidjson::StringBuffer text;
    Writer writer(text);
    const std::shared_lock<SharedMutex> lock(simulator.mutex);
    writer.StartArray();
    for (const auto& device : simulator.chassis->devices()) {
        writeDevice(writer, *simulator.chassis, *device);
    }
    writer.EndArray();
    return text.GetString();
}

std::string traceFrom(Driver& driver, std::uint64_t from) {
    const TraceMemory::Lines lines = driver.trace.latest.read(from);
    rapidjson::StringBuffer text;
    Writer writer(text);
    writer.StartObject();
    writer.Key("next");
    writer.Uint64(lines.next);
    writer.Key("lines");
    writer.StartArray();
    for (const std::string& line : lines.lines) {
        writer.String(line);
    }
    writer.EndArray();
    writer.EndObject();
    return text.GetString();
}

// Lends the text that describe(driver) returns.
template <typename Describe>
std::int32_t lendDescription(char** json, Describe describe) {
    *json = nullptr;
    try {
        *json = lendText(describe(Driver::instance()));
        return 0;
    } catch (const Refusal& refusal) {
        return refusal.code();
    } catch (...) {
        return code::outOfMemory.number;
    }
}

}  // namespace

std::int32_t qitrmcsim_getFaults(char** json) {
    return lendDescription(json, [](Driver& driver) {
        const WriteLock lock(driver.simulator.mutex);
        driver.faults.refresh();
        return driver.faults.plan()->text;
    });
}

std::int32_t qitrmcsim_describeDevices(char** json) {
    return lendDescription(json, describeDevices);
}

std::int32_t qitrmcsim_readTrace(std::uint64_t from, char** json) {
    return lendDescription(json, [&](Driver& driver) { return traceFrom(driver, from); });
}
