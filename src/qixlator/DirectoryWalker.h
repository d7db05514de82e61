#pragma once

#include <dirent.h>
#include <sys/stat.h>

namespace qixlator {

// One entry of a directory. Large, so allocate it on the heap.
struct FileEntry {
    static constexpr unsigned pathSize = 4096;
    static constexpr unsigned nameSize = 256;

    char path[pathSize];
    char name[nameSize];
    // The part of `name` after its last dot; empty if there is no dot.
    const char* extension;
    bool isDirectory;
    bool isRegularFile;
    struct stat info;
};

// Iterates over one directory in the order of the operating system, including "." and "..". Large,
// so allocate it on the heap, zero-initialised. Used by one thread.
class DirectoryWalker {
  public:
    DirectoryWalker() noexcept;
    ~DirectoryWalker();
    DirectoryWalker(const DirectoryWalker&) = delete;
    DirectoryWalker& operator=(const DirectoryWalker&) = delete;

    // Opens a directory and moves to its first entry. On failure returns false and sets errno:
    // EINVAL for a null or empty path, ENAMETOOLONG for one of 4096 bytes or more, otherwise
    // ENOENT.
    bool open(const char* directory);

    // The directory as it was when it was opened; null if that is unknown.
    const struct stat* info() const { return hasInfo ? &directoryInfo : nullptr; }

    // Whether there is a current entry.
    bool hasEntry() const { return entryAvailable; }
    // Describes the current entry. Returns 0 or an errno value; ENAMETOOLONG if its name or path is
    // too long for the record.
    int describe(FileEntry* entry) const;
    // Moves to the next entry.
    void advance();

  private:
    char path[FileEntry::pathSize];
    struct stat directoryInfo;
    bool hasInfo;
    bool entryAvailable;
    DIR* handle;
    struct dirent* current;
};

}  // namespace qixlator
