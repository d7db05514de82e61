#pragma once

#include <cstddef>

#include "qisysq/FileIdentity.h"

namespace qisysq {

// Sets `identity` to that of the file at the path. Returns false if it cannot be determined.
bool lookAtFile(const char* path, FileIdentity* identity);

// Looks at files, as many as there is room for, and what they showed.
class LookList {
  public:
    struct Look {
        // The position of the path, and its size with its NUL.
        std::size_t path;
        std::size_t size;
        FileIdentity identity;
        bool isKnown;
    };

    const Look* find(const char* path, std::size_t size) const;
    void add(const char* path, std::size_t size, const FileIdentity& identity, bool isKnown);
    // Whether a look at each of the files shows the same now.
    bool isRepeated() const;

    // Whether all that was looked at is in the list.
    bool isComplete = true;

  private:
    // A failure looks at five files.
    static constexpr std::size_t maximumCount = 8;

    Look looks[maximumCount];
    std::size_t count = 0;
    char paths[1024];
    std::size_t used = 0;
};

// While one exists, lookAtFile looks at each file only once on this thread and repeats its answer,
// so that the texts of one failure show the same state of the files. A look that finds no room in
// the memory of the object is not repeated.
class FileLooks {
  public:
    FileLooks() noexcept;
    ~FileLooks();
    FileLooks(const FileLooks&) = delete;
    FileLooks& operator=(const FileLooks&) = delete;

    // The list of the innermost one on this thread; null if there is none.
    static const LookList* current();
    // To be called when what is found out depends on more than looks: a file or a directory is
    // read, or memory runs out.
    static void setIncomplete();

  private:
    friend bool lookAtFile(const char* path, FileIdentity* identity);

    FileLooks* const outer;
    LookList list;
};

}  // namespace qisysq
