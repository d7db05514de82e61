#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "model/Values.h"

namespace simulator {

// Thrown when the state folder or a file in it cannot be used.
struct StateError {
    // The folder or file.
    std::string path;
    std::string wrong;
    std::string right;
};

// One value that lasts.
struct StateEntry {
    // The described full name, or nothing for the system.
    std::string resource;
    // The name of a property, or nothing for the content of an NVMEM area.
    std::string item;
    DataType type;
    Elements value;
};

// The values of one change, in the format of a file. Numbers are little-endian on every machine.
class StateText {
  public:
    void add(std::string_view resource, std::string_view item, DataType type,
             const Elements& value);
    // Adds the content of an NVMEM area.
    void add(std::string_view area, const std::vector<std::uint8_t>& content);

    // The whole file: head, values and checksum. Needs no values.
    std::string file(std::uint64_t generation) const;

  private:
    void addHead(std::string_view resource, std::string_view item, DataType type,
                 std::size_t count);

    std::string body;
};

// Reads the content of the file of a generation. `path` is for the text of the StateError that is
// thrown when the content is not exactly what StateText::file() made.
std::vector<StateEntry> readStateFile(const std::string& path, std::uint64_t generation,
                                      std::string_view content);

}  // namespace simulator
