#pragma once

#include <sys/types.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "state/StateFile.h"

namespace simulator {

// A file descriptor that is closed at the end of its scope; below 0 when there is none.
class Descriptor {
  public:
    explicit Descriptor(int number) : number(number) {}
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    ~Descriptor();

    operator int() const { return number; }

  private:
    int number;
};

// Stands for the file "sessions", which is replaced as a whole, where a generation is wanted.
inline constexpr std::uint64_t sessionsFile = 0;

// The folder in which one process keeps what lasts: a file for each change that still matters,
// "change-1" and so on, and the file "sessions". Other files in it are left alone.
class StateFolder {
  public:
    // Makes the folder if it is missing and locks it for as long as this object and its process
    // exist. Throws a StateError, for one when another process has it.
    explicit StateFolder(const std::string& path);

    std::string filePath(std::uint64_t generation) const;
    // The generations of the files that are there, the oldest first. Throws a StateError.
    std::vector<std::uint64_t> generations() const;
    bool has(std::uint64_t generation) const;
    // The content of a file. Throws a StateError.
    std::string read(std::uint64_t generation) const;

    // Makes a file. It is whole and on the disk when this returns. Refuses with stateNotWritten,
    // and then there is no such file of a change.
    void write(std::uint64_t generation, std::string_view content) const;
    // Removes a file if that can be done.
    void remove(std::uint64_t generation) const noexcept;

  private:
    void lock() const;

    const std::string path;
    const pid_t owner;
    const Descriptor folder;
    const Descriptor lockFile;
};

}  // namespace simulator
