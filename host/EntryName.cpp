#include "host/EntryName.h"

#include <utf8proc.h>

#include <string>

#include "host/RequestTarget.h"

namespace host {

namespace {

constexpr std::string_view kPrefix = "/qitrmc/";
constexpr uint32_t kReplacementCharacter = 0xFFFD;

std::vector<uint32_t> charactersOf(const std::string& text) {
    std::vector<uint32_t> characters;
    const auto* next = reinterpret_cast<const utf8proc_uint8_t*>(text.data());
    const auto* end = next + text.size();
    while (next != end) {
        utf8proc_int32_t character = 0;
        const utf8proc_ssize_t length = utf8proc_iterate(next, end - next, &character);
        const bool valid = length > 0;
        characters.push_back(valid ? static_cast<uint32_t>(character) : kReplacementCharacter);
        next += valid ? length : 1;
    }
    return characters;
}

void reservedOperation(ws_Entry*) {}

ws_WideString entryName(const ws_Entry* entry) {
    const std::vector<uint32_t>& name = static_cast<const Entry*>(entry)->name;
    return {name.data(), name.data() + name.size()};
}

constexpr ws_EntryOperations kOperations = {reservedOperation, reservedOperation, reservedOperation,
                                            entryName};

}  // namespace

std::optional<std::vector<uint32_t>> entryNameOfPath(std::string_view path) {
    path = pathOfTarget(path);
    if (path.substr(0, kPrefix.size()) != kPrefix)
        return std::nullopt;
    path.remove_prefix(kPrefix.size());
    if (path.empty() || path.find('/') != std::string_view::npos)
        return std::nullopt;
    return charactersOf(percentDecoded(path));
}

Entry::Entry(const std::vector<uint32_t>& name) : ws_Entry{&kOperations}, name(name) {}

}  // namespace host
