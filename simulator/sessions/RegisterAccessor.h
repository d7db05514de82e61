#pragma once

#include "sessions/Simulator.h"

namespace simulator {

// Reads and writes registers for one session, width bytes (1, 2, 4 or 8) at a time. Needs the
// simulator's mutex to be held.
class RegisterAccessor {
  public:
    RegisterAccessor(Simulator& simulator, Session& session)
        : simulator(simulator), session(session) {}

    // Refuses with misalignedRegister, unmappedRegister and writeOnlyRegister.
    std::uint64_t read(Device& device, std::uint32_t address, std::uint32_t width);

    // Writes the register and carries out its command, or does neither. Refuses with
    // misalignedRegister, unmappedRegister and readOnlyRegister, where the property that the
    // register shows does not take the value, and where the command fails. Returns the warning of
    // the command, owned by the command, or null.
    const Refusal* write(Device& device, std::uint32_t address, std::uint32_t width,
                         std::uint64_t value);

  private:
    std::uint64_t readProperty(const RegisterBlock& block, std::uint32_t address);
    void writeProperty(const RegisterBlock& block, std::uint32_t address, std::uint32_t width,
                       std::uint64_t value);

    Simulator& simulator;
    Session& session;
};

}  // namespace simulator
