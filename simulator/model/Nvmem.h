#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Api.h"

namespace simulator {

// The content of one NVMEM area. Written bytes are read back at once, and lasting when committed.
class NvmemMemory {
  public:
    // What a write needs.
    struct WriteRules {
        bool writable = true;
        bool wantsSerialNumber = false;
        // Empty when none is wanted.
        std::string password;
    };

    NvmemMemory() = default;
    NvmemMemory(std::vector<std::uint8_t> content, WriteRules rules)
        : lasting(std::move(content)), rules(std::move(rules)) {}

    // Takes lasting content of the same size.
    void restore(const std::vector<std::uint8_t>& content) { lasting = content; }

    std::uint32_t size() const { return static_cast<std::uint32_t>(lasting.size()); }
    bool hasPending() const { return pending.has_value(); }
    const WriteRules& writeRules() const { return rules; }

    // What is read: the lasting content with what was written since.
    const std::vector<std::uint8_t>& current() const {
        return pending ? pending->content : lasting;
    }

    // Refuse with nvmemOutOfRange when the bytes do not lie in the area.
    void read(std::uint32_t address, std::uint8_t* buffer, std::uint32_t count) const;
    void write(nQITRMCAPI100_Session session, std::uint32_t address, const std::uint8_t* bytes,
               std::uint32_t count);

    // Refuses with readOnlyNvmemArea, wrongSerialNumber and wrongPassword.
    void unlock(std::string_view given, std::string_view deviceSerialNumber,
                std::string_view givenPassword) const;

    void commit();
    // Discard what was written since the last commit: all of it, or if one session wrote last.
    void drop() { pending.reset(); }
    void dropPending(nQITRMCAPI100_Session session);

  private:
    struct Pending {
        std::vector<std::uint8_t> content;
        // The session that wrote last.
        nQITRMCAPI100_Session session;
    };

    void expectInside(std::uint32_t address, std::uint32_t count) const;

    std::vector<std::uint8_t> lasting;
    WriteRules rules;
    std::optional<Pending> pending;
};

}  // namespace simulator
