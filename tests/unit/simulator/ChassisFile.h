#pragma once

#include <unistd.h>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>

namespace drivertest {

// A chassis description in a temporary file, which is removed with this object.
class ChassisFile {
  public:
    explicit ChassisFile(const std::string& text) {
        std::string pattern = "/tmp/chassisXXXXXX";
        const int file = mkstemp(pattern.data());
        ::close(file);
        path = pattern;
        std::ofstream(path, std::ios::binary) << text;
    }
    ChassisFile(const ChassisFile&) = delete;
    ChassisFile& operator=(const ChassisFile&) = delete;
    ~ChassisFile() { std::remove(path.c_str()); }

    std::string path;
};

}  // namespace drivertest
