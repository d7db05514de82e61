#include "ini/IniFile.h"

#include <sys/stat.h>

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <memory>
#include <new>
#include <stdexcept>

#include "ini/LineReader.h"
#include "ini/Parser.h"
#include "ini/nameComparison.h"

namespace {

struct Close {
    void operator()(std::FILE* stream) const noexcept { std::fclose(stream); }
};

using Stream = std::unique_ptr<std::FILE, Close>;

std::int32_t whyNotOpened(const char* path) {
    struct stat properties;
    return stat(path, &properties) != 0 ? ini_errorNoSuchFile : ini_errorCannotOpen;
}

std::int32_t read(std::FILE* stream, IniFile& file) {
    ini::LineReader reader(stream);
    if (!reader.passByteOrderMark()) {
        return ini_errorUnsupportedEncoding;
    }
    ini::Parser parser(file);
    std::string line;
    line.reserve(256);
    while (reader.next(line)) {
        parser.addLine(line);
    }
    if (std::ferror(stream) != 0) {
        return ini_errorCannotOpen;
    }
    parser.joinSplitValues();
    return 0;
}

std::int32_t load(IniFile& file, const char* path) {
    const Stream stream(std::fopen(path, "rbe"));
    if (stream == nullptr) {
        return whyNotOpened(path);
    }
    IniFile fresh;
    fresh.mergeRepeated = file.mergeRepeated;
    fresh.ignoreCase = file.ignoreCase;
    fresh.flags = file.flags;
    const std::int32_t result = read(stream.get(), fresh);
    if (result != 0) {
        return result;
    }
    fresh.path = path;
    struct stat properties;
    if (fstat(fileno(stream.get()), &properties) == 0) {
        fresh.modified = properties.st_mtime;
    }
    file = std::move(fresh);
    return 0;
}

// The value of a key, or null.
const std::string* find(const IniFile& file, std::string_view sectionName, std::string_view key) {
    const auto section =
        std::find_if(file.sections.begin(), file.sections.end(),
                     [&](const IniSection& each) { return ini::sameName(each.name, sectionName); });
    if (section == file.sections.end()) {
        return nullptr;
    }
    const auto entry =
        std::find_if(section->entries.begin(), section->entries.end(),
                     [&](const IniEntry& each) { return ini::sameName(each.key, key); });
    return entry != section->entries.end() ? &entry->value : nullptr;
}

// Parses an optional plus sign and digits, with optional blanks on both sides.
bool parseUnsigned(std::string_view text, std::uint32_t& number) {
    text = ini::withoutTrailingBlanks(ini::withoutLeadingBlanks(text));
    if (!text.empty() && text.front() == '+') {
        text.remove_prefix(1);
    }
    const char* end = text.data() + text.size();
    const auto [behind, error] = std::from_chars(text.data(), end, number);
    return error == std::errc() && behind == end;
}

}  // namespace

IniFile* IniFile_create() noexcept {
    return new (std::nothrow) IniFile;
}

void IniFile_destroy(IniFile* file) noexcept {
    delete file;
}

std::int32_t IniFile_load(IniFile* file, const char* path) noexcept {
    if (path == nullptr) {
        return ini_errorNoSuchFile;
    }
    if (file == nullptr) {
        return ini_errorOutOfMemory;
    }
    try {
        return load(*file, path);
    } catch (const std::bad_alloc&) {
        return ini_errorOutOfMemory;
    } catch (const std::length_error&) {
        return ini_errorOutOfMemory;
    }
}

std::int32_t IniFile_getInt(const IniFile* file, const char* section, const char* key,
                            std::uint32_t* value) noexcept {
    if (file == nullptr) {
        return 0;
    }
    const std::string* text = find(*file, section, key);
    if (text == nullptr || text->empty()) {
        return 0;
    }
    std::uint32_t number = 0;
    if (!parseUnsigned(*text, number)) {
        return ini_errorNoInteger;
    }
    *value = number;
    return 1;
}
