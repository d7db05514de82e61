#pragma once

#include <cstdint>

// The JSON schemas and Lua scripts that the program carries as constant data, so that it needs no
// such file on the controller. All of it is read-only: any thread may use it at any time.

struct EmbeddedFile {
    // With its extension and without a folder.
    const char* name;
    // The bytes as they stand in the source file. A NUL follows the last one, so that a file
    // without a NUL of its own can be read as a C text.
    const char* data;
    // The count of bytes, without that NUL.
    std::uint32_t size;
};

// The files in table order, for a range-based loop.
struct EmbeddedFiles {
    const EmbeddedFile* first;
    const EmbeddedFile* last;

    const EmbeddedFile* begin() const noexcept { return first; }
    const EmbeddedFile* end() const noexcept { return last; }
};

EmbeddedFiles embeddedFiles() noexcept;

// The data of the file of exactly this name. Throws std::out_of_range when there is none, which is
// a defect of the program.
const char* embeddedText(const char* name);
