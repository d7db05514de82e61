#pragma once

#include <sys/stat.h>
#include <sys/types.h>

#include <cstdint>
#include <string>

namespace simulator {

// Identifies a state of a file, to notice changes.
struct FileVersion {
    FileVersion() = default;
    explicit FileVersion(const struct stat& state);

    bool operator==(const FileVersion& other) const;
    bool operator!=(const FileVersion& other) const { return !(*this == other); }

    // The other members are meaningful only if the file exists.
    bool exists = false;
    bool isPipe = false;
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    std::int64_t seconds = 0;
    std::int64_t nanoseconds = 0;
};

// The present version of a file. If it cannot be determined, only `exists` is set.
FileVersion versionOf(const std::string& path) noexcept;

struct TextFile {
    std::string text;
    FileVersion version;
};

// Reads a file of at most 16 MiB. Throws DescriptionError, in which `right` says what the file has
// to be.
TextFile readTextFile(const std::string& path, const char* right);

}  // namespace simulator
