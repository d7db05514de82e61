// Folder ini: reads configuration files in the ini format.
#pragma once

#include <cstdint>
#include <ctime>
#include <string>
#include <vector>

// A file object may be used by one thread at a time.

struct IniEntry {
    std::string key;
    std::string value;
    std::int32_t line;  // counted from 1
    char quote;         // the quote character that was stripped from the value, or 0
};

struct IniSection {
    std::string name;
    std::vector<IniEntry> entries;
    std::int32_t line;
};

// Bits of IniFile::flags.
enum IniFlag : std::uint32_t {
    ini_acceptEmptyValues = 1,
    ini_stripDoubleQuotes = 2,
    ini_stripSingleQuotes = 4,
    // ":" and ":=" separate a key from its value as "=" does, and keys before the first section
    // belong to a section named "(null)".
    ini_acceptColons = 8,
};

// Negative results.
enum IniError : std::int32_t {
    ini_errorUnsupportedEncoding = -3,  // a byte order mark of UTF-16 or UTF-32
    ini_errorOutOfMemory = -12,
    ini_errorNoSuchFile = -22,
    ini_errorCannotOpen = -5001,  // the file exists and cannot be opened or read
    ini_errorNoInteger = -5022,
};

struct IniFile {
    std::vector<IniSection> sections;  // in the order of the file
    std::int32_t firstBadLine = -1;    // the first line that could not be parsed, or -1
    bool mergeRepeated = true;         // a repeated section or key is merged into the earlier one
    bool ignoreCase = true;            // in the names of sections and keys
    std::uint32_t flags = ini_stripDoubleQuotes;
    std::string path;          // empty before a load
    std::time_t modified = 0;  // modification time of the loaded file
};

// Creates an empty file object, to be freed with IniFile_destroy. Returns null if memory runs out.
IniFile* IniFile_create() noexcept;
void IniFile_destroy(IniFile* file) noexcept;

// Replaces the contents of `file` by those of the file at `path`. Returns 0 or an IniError; after
// an error `file` is unchanged. Lines that cannot be parsed are skipped without an error.
std::int32_t IniFile_load(IniFile* file, const char* path) noexcept;

// Reads an unsigned decimal integer. Returns 1; 0 if the section or key is missing or the value is
// empty; or ini_errorNoInteger. `value` is written only if the result is 1. A null `file` counts as
// an empty one.
std::int32_t IniFile_getInt(const IniFile* file, const char* section, const char* key,
                            std::uint32_t* value) noexcept;
