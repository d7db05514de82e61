#pragma once

#include <dirent.h>
#include <sys/stat.h>

namespace qixlator {

// What is known of one entry of a directory. Large: made on the heap.
struct FileEntry {
    static constexpr unsigned pathSize = 4096;
    static constexpr unsigned nameSize = 256;

    char path[pathSize];
    char name[nameSize];
    // The part of `name` behind its last dot; empty when there is no dot.
    const char* extension;
    bool isDirectory;
    bool isRegularFile;
    struct stat info;
};

// Walks through one directory, in the order that the operating system gives, "." and ".." included.
// Large: made on the heap, zero-initialised. Used by one thread.
class DirectoryWalker {
  public:
    DirectoryWalker() noexcept;
    ~DirectoryWalker();
    DirectoryWalker(const DirectoryWalker&) = delete;
    DirectoryWalker& operator=(const DirectoryWalker&) = delete;

    // Opens a directory and goes to its first entry. On failure returns false and sets errno:
    // EINVAL for a null or empty path, ENAMETOOLONG for one of 4096 bytes or more, else ENOENT.
    bool open(const char* directory);

    // Whether the walk stands at an entry.
    bool hasEntry() const { return entryAvailable; }
    // Describes the current entry. Returns 0 or an errno; ENAMETOOLONG when its name or its path is
    // too long for the record.
    int describe(FileEntry* entry) const;
    // Goes to the next entry.
    void advance();

  private:
    char path[FileEntry::pathSize];
    bool entryAvailable;
    DIR* handle;
    struct dirent* current;
};

}  // namespace qixlator
