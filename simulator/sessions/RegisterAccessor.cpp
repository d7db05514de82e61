#include "sessions/RegisterAccessor.h"

#include "model/RegisterValues.h"
#include "sessions/CommandRun.h"
#include "sessions/PropertyAccessor.h"
#include "status/Refusal.h"

namespace simulator {

std::uint64_t RegisterAccessor::readProperty(const RegisterBlock& block, std::uint32_t address) {
    const PropertyDefinition& definition = *block.property->definition;
    const std::string owner = block.owner->fullName();
    const ReadValue value =
        PropertyAccessor(simulator, session).read(owner, definition.name, definition.type);
    return toRegister(value.elements(), block.size()) >> (8 * (address - block.address));
}

std::uint64_t RegisterAccessor::read(Device& device, std::uint32_t address, std::uint32_t width) {
    RegisterBlock& block = device.registers.find(address, width);
    if (!block.readable) {
        throw Refusal(code::writeOnlyRegister).usage(tag::registerAddress, address);
    }
    return block.property != nullptr ? readProperty(block, address)
                                     : device.registers.read(block, address, width);
}

void RegisterAccessor::writeProperty(const RegisterBlock& block, std::uint32_t address,
                                     std::uint32_t width, std::uint64_t value) {
    const Property& property = *block.property;
    const PropertyDefinition& definition = *property.definition;
    RegisterBlock image;
    image.address = block.address;
    image.bytes.resize(block.size());
    // The bytes around those that are written are those of the value that was written last.
    const Elements& before = property.pending ? property.pending->value : property.value;
    image.write(block.address, block.size(), toRegister(before, block.size()));
    image.write(address, width, value);
    PropertyAccessor(simulator, session)
        .write(
            block.owner->fullName(), definition.name, definition.type,
            fromRegister(definition.type, image.read(block.address, block.size()), block.size()));
}

const Refusal* RegisterAccessor::write(Device& device, std::uint32_t address, std::uint32_t width,
                                       std::uint64_t value) {
    simulator.reservations.expectWritable(session.handle, device);
    RegisterBlock& block = device.registers.find(address, width);
    if (!block.writable) {
        throw Refusal(code::readOnlyRegister).usage(tag::registerAddress, address);
    }
    if (block.property != nullptr) {
        writeProperty(block, address, width, value);
        return nullptr;
    }
    const Refusal* warning = nullptr;
    if (!block.command.empty()) {
        expectReady(device, simulator, session.handle);
        warning = finish({{&device, device.command(block.command)}}, simulator);
    }
    block.write(address, width, value);
    return warning;
}

}  // namespace simulator
