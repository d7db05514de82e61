#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "ini/IniFile.h"

namespace ini_test {

// A file of the given content, removed at the end.
class TemporaryFile {
  public:
    explicit TemporaryFile(const std::string& content) {
        const int descriptor = mkstemp(&path[0]);
        EXPECT_GE(descriptor, 0);
        close(descriptor);
        std::ofstream(path, std::ios::binary) << content;
    }
    ~TemporaryFile() { unlink(path.c_str()); }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    const char* name() const { return path.c_str(); }

  private:
    std::string path = testing::TempDir() + "ini_XXXXXX";
};

struct Destroy {
    void operator()(IniFile* file) const { IniFile_destroy(file); }
};
using File = std::unique_ptr<IniFile, Destroy>;

inline File created(std::uint32_t flags = ini_stripDoubleQuotes) {
    File file(IniFile_create());
    file->flags = flags;
    return file;
}

inline File loaded(const std::string& content, std::uint32_t flags = ini_stripDoubleQuotes) {
    const TemporaryFile source(content);
    File file = created(flags);
    EXPECT_EQ(IniFile_load(file.get(), source.name()), 0);
    return file;
}

// The sections and entries of a file, one text each: "[name]" and "key=value".
inline std::vector<std::string> contents(const IniFile& file) {
    std::vector<std::string> result;
    for (const IniSection& section : file.sections) {
        result.push_back("[" + section.name + "]");
        for (const IniEntry& entry : section.entries) {
            result.push_back(entry.key + "=" + entry.value);
        }
    }
    return result;
}

using Texts = std::vector<std::string>;

}  // namespace ini_test
