#include "support/TestRoot.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "qisysq/installRoot.h"

namespace {

std::string currentRoot;

}  // namespace

const char* qisysq_installRoot() {
    return currentRoot.c_str();
}

TestRoot::TestRoot() {
    std::string pattern = (std::filesystem::temp_directory_path() / "qitrmc-root-XXXXXX").string();
    currentRoot = ::mkdtemp(pattern.data());
}

TestRoot::~TestRoot() {
    std::filesystem::remove_all(currentRoot);
    currentRoot.clear();
}

void TestRoot::write(const std::string& path, const std::string& content) const {
    const std::string file = locate(path);
    std::filesystem::create_directories(std::filesystem::path(file).parent_path());
    std::ofstream(file, std::ios::binary) << content;
}

void TestRoot::makeDirectory(const std::string& path) const {
    std::filesystem::create_directories(locate(path));
}

void TestRoot::showDirectory(const std::string& path, const std::string& directory) const {
    const std::filesystem::path place = locate(path);
    std::filesystem::create_directories(place.parent_path());
    std::filesystem::create_directory_symlink(directory, place);
}

void TestRoot::remove(const std::string& path) const {
    std::filesystem::remove_all(locate(path));
}

std::string TestRoot::locate(const std::string& path) const {
    return currentRoot + path;
}
