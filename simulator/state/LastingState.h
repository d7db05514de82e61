#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "model/Chassis.h"
#include "state/StateFile.h"
#include "state/StateFolder.h"

namespace simulator {

// The lasting state that one call changes.
class Change {
  public:
    // wanted: whether anything lasts at all; if not, nothing is gathered here.
    explicit Change(bool wanted) : wanted(wanted) {}

    // The value that a property is to have; owner is null for the system. Nothing is gathered for
    // a property that does not last.
    void property(const Resource* owner, const PropertyDefinition& definition,
                  const Elements& value);
    void content(const NvmemArea& area);
    // The name that a device is to have, and how many names will have changed then.
    void name(const Device& device, const std::string& newName, std::uint64_t changes);

  private:
    friend class LastingState;

    void add(const std::string& resource, const std::string& item, DataType type,
             const Elements& value);

    bool wanted;
    StateText text;
    std::vector<std::string> keys;
};

// What outlasts the process: committed NVMEM, names, and the properties that are defined as
// lasting. It is kept in the folder of QITRMC_SIM_STATE; without that variable nothing is kept.
// Things are known by their described names. Each change is a file of its own, which replaces what
// older ones say; a file is removed when nothing in it matters any more. Needs the simulator's
// mutex to be held.
class LastingState {
  public:
    // Puts into the chassis what is kept of it. What is kept of other things stays in the folder;
    // what does not fit is reported on standard error and not used. Refuses with stateNotUsable.
    explicit LastingState(Chassis& chassis);

    Change change() const { return Change(folder.has_value()); }

    // Writes a change to the disk, whole or not at all. To be called before the change takes effect
    // in memory. Refuses with stateNotWritten.
    void keep(const Change& change);

    // Makes sure that no later start gives out this number of a session again. Numbers are reserved
    // in blocks, so that few sessions wait for the disk; a restart continues after the last block.
    // Refuses with stateNotWritten.
    void reserveSessionNumber(std::uint32_t number);

  private:
    using Generation = std::uint64_t;
    using Entries = std::map<std::string, StateEntry>;

    // Reads all files: the latest entry for each key.
    Entries load();
    void loadSessionNumber(Chassis& chassis) const;
    // Makes room for what settle() notes.
    void prepare(const std::vector<std::string>& keys);
    // Notes that the next generation holds the keys, and removes files that this makes useless.
    void settle(const std::vector<std::string>& keys) noexcept;

    std::optional<StateFolder> folder;
    // The first number after the block that was reserved last since the start.
    std::optional<std::uint32_t> reservedEnd;
    // Which file holds the latest value; 0 for none.
    std::map<std::string, Generation> holders;
    // How many latest values a file holds.
    std::map<Generation, std::size_t> uses;
    Generation next = 1;
};

}  // namespace simulator
