#include "entries/Entry.h"
#include "sessions/RegisterAccessor.h"

using namespace simulator;

namespace {

template <typename Number>
void readRegister(const char* function, nQITRMCAPI100_Session session, const char* device,
                  std::uint32_t address, Number* value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&] {
        return Call(function)
            .session(session)
            .resources("device", device)
            .in("address", address)
            .out("value", value);
    };
    withSharedSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        Device& found = simulator.resolver(owner).oneDevice(required(device, "device"));
        RegisterAccessor accessor(simulator, owner);
        *value = static_cast<Number>(accessor.read(found, address, sizeof(Number)));
    });
}

template <typename Number>
void writeRegister(const char* function, nQITRMCAPI100_Session session, const char* device,
                   std::uint32_t address, Number value, qierr_Status* status) {
    const auto call = [&] {
        return Call(function)
            .session(session)
            .resources("device", device)
            .in("address", address)
            .in("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        Device& found = simulator.resolver(owner).oneDevice(required(device, "device"));
        RegisterAccessor accessor(simulator, owner);
        if (const Refusal* warning = accessor.write(found, address, sizeof(Number), value)) {
            report(*warning, *status);
        }
    });
}

}  // namespace

// The two functions of one width.
#define REGISTER_FUNCTIONS(Name, Number)                                                      \
    void nQITRMCAPI100_readRegister##Name(nQITRMCAPI100_Session session, const char* device,  \
                                          std::uint32_t address, Number* value,               \
                                          qierr_Status* status) {                             \
        readRegister(__func__, session, device, address, value, status);                      \
    }                                                                                         \
    void nQITRMCAPI100_writeRegister##Name(nQITRMCAPI100_Session session, const char* device, \
                                           std::uint32_t address, Number value,               \
                                           qierr_Status* status) {                            \
        writeRegister(__func__, session, device, address, value, status);                     \
    }

REGISTER_FUNCTIONS(UInt8, std::uint8_t)
REGISTER_FUNCTIONS(UInt16, std::uint16_t)
REGISTER_FUNCTIONS(UInt32, std::uint32_t)
REGISTER_FUNCTIONS(UInt64, std::uint64_t)

#undef REGISTER_FUNCTIONS
