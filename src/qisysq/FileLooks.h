#pragma once

#include <cstddef>

#include "qisysq/FileIdentity.h"

namespace qisysq {

// Sets `identity` to that of the file at the path. Returns false if it cannot be determined.
bool lookAtFile(const char* path, FileIdentity* identity);

// While one exists, lookAtFile looks at each file only once on this thread and repeats its answer,
// so that the texts of one failure show the same state of the files. A look that finds no room in
// the memory of the object is not repeated.
class FileLooks {
  public:
    FileLooks() noexcept;
    ~FileLooks();
    FileLooks(const FileLooks&) = delete;
    FileLooks& operator=(const FileLooks&) = delete;

  private:
    friend bool lookAtFile(const char* path, FileIdentity* identity);

    struct Look {
        const char* path;
        std::size_t size;
        FileIdentity identity;
        bool isKnown;
    };
    // A failure looks at five files.
    static constexpr std::size_t maximumCount = 8;

    // `size` is that of the path with its NUL.
    const Look* find(const char* path, std::size_t size) const;
    void add(const char* path, std::size_t size, const FileIdentity& identity, bool isKnown);

    FileLooks* const outer;
    Look looks[maximumCount];
    std::size_t count = 0;
    char paths[1024];
    std::size_t used = 0;
};

}  // namespace qisysq
