// Folder embedded: the JSON schemas and Lua scripts that are compiled into the program.
#pragma once

#include <cstdint>

// The files are constant data, so none of them has to be installed on the controller. Any thread
// may read them at any time.

struct EmbeddedFile {
    // With its extension, without a folder.
    const char* name;
    // The bytes of the source file, followed by a NUL, so that a file that contains no NUL can be
    // read as a C string.
    const char* data;
    // The number of bytes, without that NUL.
    std::uint32_t size;
};

// The files in the order of the table, for a range-based loop.
struct EmbeddedFiles {
    const EmbeddedFile* first;
    const EmbeddedFile* last;

    const EmbeddedFile* begin() const noexcept { return first; }
    const EmbeddedFile* end() const noexcept { return last; }
};

EmbeddedFiles embeddedFiles() noexcept;

// The data of the file with exactly this name. Throws std::out_of_range if there is no such file,
// which is a programming error.
const char* embeddedText(const char* name);
