#include "host/EntryName.h"

#include <string>

#include "common/utf8.h"
#include "host/RequestTarget.h"

namespace host {

namespace {

constexpr std::string_view prefix = "/qitrmc/";
constexpr std::uint32_t replacementCharacter = 0xFFFD;

std::vector<std::uint32_t> charactersOf(std::string_view text) {
    std::vector<std::uint32_t> characters;
    characters.reserve(text.size());
    while (!text.empty()) {
        const common::Utf8Character character = common::takeCharacter(text);
        characters.push_back(character.isValid() ? static_cast<std::uint32_t>(character.codePoint)
                                                 : replacementCharacter);
    }
    return characters;
}

void reservedOperation(ws_Entry*) {}

ws_WideString entryName(const ws_Entry* entry) {
    const std::vector<std::uint32_t>& name = static_cast<const Entry*>(entry)->name;
    return {name.data(), name.data() + name.size()};
}

constexpr ws_EntryOperations entryOperations = {reservedOperation, reservedOperation,
                                                reservedOperation, entryName};

}  // namespace

std::optional<std::vector<std::uint32_t>> entryNameOfPath(std::string_view path) {
    path = pathOfTarget(path);
    if (path.substr(0, prefix.size()) != prefix) {
        return std::nullopt;
    }
    path.remove_prefix(prefix.size());
    if (path.empty() || path.find('/') != std::string_view::npos) {
        return std::nullopt;
    }
    return charactersOf(percentDecoded(path));
}

Entry::Entry(const std::vector<std::uint32_t>& name) : ws_Entry{&entryOperations}, name(name) {}

}  // namespace host
