#pragma once

#include <string>

// A tree in a temporary folder that replaces the target's file system for the code under test,
// which must be linked with this library in place of qisysq_root. Only one may exist at a time.
class TestRoot {
  public:
    TestRoot();
    ~TestRoot();
    TestRoot(const TestRoot&) = delete;
    TestRoot& operator=(const TestRoot&) = delete;

    // Writes a file under its absolute path on the target and creates its folders.
    void write(const std::string& path, const std::string& content) const;
    void makeDirectory(const std::string& path) const;
    // Makes a directory of this machine appear under an absolute path on the target.
    void showDirectory(const std::string& path, const std::string& directory) const;
    void remove(const std::string& path) const;
    // The path on this machine of a path on the target.
    std::string locate(const std::string& path) const;
};
