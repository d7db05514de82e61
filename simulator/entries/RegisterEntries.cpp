#include "entries/Border.h"
#include "sessions/RegisterDesk.h"

using namespace simulator;

namespace {

template <typename Number>
void readRegister(const char* function, nQITRMCAPI100_Session session, const char* device,
                  uint32_t address, Number* value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&] {
        return Call(function)
            .session(session)
            .resources("device", device)
            .in("address", address)
            .out("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        Device& found = simulator.resolver(owner).oneDevice(required(device, "device"));
        RegisterDesk desk(simulator, owner);
        *value = static_cast<Number>(desk.read(found, address, sizeof(Number)));
    });
}

template <typename Number>
void writeRegister(const char* function, nQITRMCAPI100_Session session, const char* device,
                   uint32_t address, Number value, qierr_Status* status) {
    const auto call = [&] {
        return Call(function)
            .session(session)
            .resources("device", device)
            .in("address", address)
            .in("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        Device& found = simulator.resolver(owner).oneDevice(required(device, "device"));
        RegisterDesk desk(simulator, owner);
        if (const Refusal* warning = desk.write(found, address, sizeof(Number), value)) {
            report(*warning, *status);
        }
    });
}

}  // namespace

void nQITRMCAPI100_readRegisterUInt8(nQITRMCAPI100_Session session, const char* device,
                                     uint32_t address, uint8_t* value, qierr_Status* status) {
    readRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_readRegisterUInt16(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint16_t* value, qierr_Status* status) {
    readRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_readRegisterUInt32(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint32_t* value, qierr_Status* status) {
    readRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_readRegisterUInt64(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint64_t* value, qierr_Status* status) {
    readRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_writeRegisterUInt8(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint8_t value, qierr_Status* status) {
    writeRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_writeRegisterUInt16(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint16_t value, qierr_Status* status) {
    writeRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_writeRegisterUInt32(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint32_t value, qierr_Status* status) {
    writeRegister(__func__, session, device, address, value, status);
}

void nQITRMCAPI100_writeRegisterUInt64(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint64_t value, qierr_Status* status) {
    writeRegister(__func__, session, device, address, value, status);
}
