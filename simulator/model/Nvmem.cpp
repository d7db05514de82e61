#include "model/Nvmem.h"

#include <algorithm>

#include "status/Refusal.h"

namespace simulator {

void NvmemMemory::expectInside(std::uint32_t address, std::uint32_t count) const {
    if (std::uint64_t{address} + count > lasting.size()) {
        throw Refusal(code::nvmemOutOfRange)
            .usage(tag::nvmemAddress, address)
            .usage(tag::requestedBytes, count)
            .usage(tag::areaSize, size());
    }
}

void NvmemMemory::read(std::uint32_t address, std::uint8_t* buffer, std::uint32_t count) const {
    expectInside(address, count);
    std::copy_n(current().begin() + address, count, buffer);
}

void NvmemMemory::write(nQITRMCAPI100_Session session, std::uint32_t address,
                        const std::uint8_t* bytes, std::uint32_t count) {
    expectInside(address, count);
    if (!pending) {
        pending = Pending{lasting, session};
    }
    pending->session = session;
    std::copy_n(bytes, count, pending->content.begin() + address);
}

void NvmemMemory::unlock(std::string_view given, std::string_view deviceSerialNumber,
                         std::string_view givenPassword) const {
    if (!rules.writable) {
        throw Refusal(code::readOnlyNvmemArea);
    }
    if (rules.wantsSerialNumber && given != deviceSerialNumber) {
        throw Refusal(code::wrongSerialNumber).usage(tag::requestedValue, given);
    }
    if (!rules.password.empty() && givenPassword != rules.password) {
        throw Refusal(code::wrongPassword);
    }
}

void NvmemMemory::commit() {
    if (pending) {
        lasting = std::move(pending->content);
        pending.reset();
    }
}

void NvmemMemory::dropPending(nQITRMCAPI100_Session session) {
    if (pending && pending->session == session) {
        pending.reset();
    }
}

}  // namespace simulator
