#include "state/LastingState.h"

#include <cstdio>
#include <cstdlib>

#include "model/NameText.h"
#include "state/Restoring.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

constexpr std::uint32_t sessionBlock = 100;
constexpr const char* nextSessionItem = "Sys.NextSession";

std::string keyOf(const std::string& resource, const std::string& item) {
    return foldName(resource) + '\n' + item;
}

[[noreturn]] void refuse(const StateError& fault) {
    const std::string words = fault.wrong + "; " + fault.right;
    std::fprintf(stderr, "qitrmcapi: %s: %s\n", fault.path.c_str(), words.c_str());
    throw Refusal(code::stateNotUsable)
        .usage(tag::fileName, fault.path)
        .usage(tag::explanation, words);
}

}  // namespace

void Change::add(const std::string& resource, const std::string& item, DataType type,
                 const Elements& value) {
    text.add(resource, item, type, value);
    keys.push_back(keyOf(resource, item));
}

void Change::property(const Resource* owner, const PropertyDefinition& definition,
                      const Elements& value) {
    if (wanted && definition.lasting) {
        add(owner != nullptr ? owner->describedName() : std::string(), definition.name,
            definition.type, value);
    }
}

void Change::content(const NvmemArea& area) {
    if (wanted && area.memory.hasPending()) {
        const std::string resource = area.describedName();
        text.add(resource, area.memory.current());
        keys.push_back(keyOf(resource, contentItem));
    }
}

void Change::name(const Device& device, const std::string& newName, std::uint64_t changes) {
    if (wanted) {
        add(device.describedName(), nameItem, DataType::Text, List<std::string>{newName});
        add("", changesItem, DataType::Uint64, List<std::uint64_t>{changes});
    }
}

LastingState::LastingState(Chassis& chassis) {
    const char* path = std::getenv("QITRMC_SIM_STATE");
    if (path == nullptr || *path == '\0') {
        return;
    }
    try {
        folder.emplace(path);
        restore(load(), path, chassis);
        loadSessionNumber(chassis);
    } catch (const StateError& fault) {
        refuse(fault);
    }
}

LastingState::Entries LastingState::load() {
    Entries latest;
    for (const Generation generation : folder->generations()) {
        next = generation;
        std::vector<std::string> keys;
        for (StateEntry& entry :
             readStateFile(folder->filePath(generation), generation, folder->read(generation))) {
            keys.push_back(keyOf(entry.resource, entry.item));
            latest.insert_or_assign(keys.back(), std::move(entry));
        }
        prepare(keys);
        settle(keys);
    }
    return latest;
}

void LastingState::prepare(const std::vector<std::string>& keys) {
    uses.try_emplace(next, 0);
    for (const std::string& key : keys) {
        holders.try_emplace(key, 0);
    }
}

void LastingState::settle(const std::vector<std::string>& keys) noexcept {
    for (const std::string& key : keys) {
        Generation& holder = holders.find(key)->second;
        if (holder == next) {
            continue;
        }
        const auto old = uses.find(holder);
        if (old != uses.end() && --old->second == 0) {
            folder->remove(holder);
            uses.erase(old);
        }
        holder = next;
        ++uses.find(next)->second;
    }
    ++next;
}

void LastingState::keep(const Change& change) {
    if (!change.keys.empty()) {
        prepare(change.keys);
        folder->write(next, change.text.file(next));
        settle(change.keys);
    }
}

void LastingState::loadSessionNumber(Chassis& chassis) const {
    if (!folder->has(sessionsFile)) {
        return;
    }
    for (const StateEntry& entry :
         readStateFile(folder->filePath(sessionsFile), sessionsFile, folder->read(sessionsFile))) {
        const auto* number = std::get_if<List<std::uint32_t>>(&entry.value);
        if (entry.item == nextSessionItem && number != nullptr && number->size() == 1) {
            chassis.firstSessionHandle = number->front();
        }
    }
}

void LastingState::reserveSessionNumber(std::uint32_t number) {
    // Numbers wrap around, and so does this difference.
    const bool isReserved = reservedEnd && *reservedEnd - number - 1 < sessionBlock;
    if (!folder || isReserved) {
        return;
    }
    const std::uint32_t end = number + sessionBlock;
    StateText text;
    text.add("", nextSessionItem, DataType::Uint32, List<std::uint32_t>{end});
    folder->write(sessionsFile, text.file(sessionsFile));
    reservedEnd = end;
}

}  // namespace simulator
