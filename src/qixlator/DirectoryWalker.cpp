#include "qixlator/DirectoryWalker.h"

#include <cerrno>
#include <cstring>

namespace qixlator {

DirectoryWalker::DirectoryWalker() noexcept
    : path{},
      directoryInfo{},
      hasInfo(false),
      entryAvailable(false),
      handle(nullptr),
      current(nullptr) {}

DirectoryWalker::~DirectoryWalker() {
    if (handle != nullptr) {
        closedir(handle);
    }
}

bool DirectoryWalker::open(const char* directory) {
    if (directory == nullptr || directory[0] == '\0') {
        errno = EINVAL;
        return false;
    }
    if (std::strlen(directory) >= sizeof path) {
        errno = ENAMETOOLONG;
        return false;
    }
    std::strcpy(path, directory);
    // Before the entries are read, so that a later change of the directory shows.
    hasInfo = stat(path, &directoryInfo) == 0;
    handle = opendir(path);
    if (handle == nullptr) {
        errno = ENOENT;
        return false;
    }
    advance();
    return true;
}

void DirectoryWalker::advance() {
    current = readdir(handle);
    entryAvailable = current != nullptr;
}

int DirectoryWalker::describe(FileEntry* entry) const {
    const std::size_t directoryLength = std::strlen(path);
    const std::size_t nameLength = std::strlen(current->d_name);
    if (nameLength >= sizeof entry->name ||
        directoryLength + 1 + nameLength >= sizeof entry->path) {
        return ENAMETOOLONG;
    }
    std::strcpy(entry->name, current->d_name);
    std::strcpy(entry->path, path);
    entry->path[directoryLength] = '/';
    std::strcpy(entry->path + directoryLength + 1, entry->name);
    const char* dot = std::strrchr(entry->name, '.');
    entry->extension = dot == nullptr ? entry->name + nameLength : dot + 1;
    if (stat(entry->path, &entry->info) != 0) {
        return errno;
    }
    entry->isDirectory = S_ISDIR(entry->info.st_mode);
    entry->isRegularFile = S_ISREG(entry->info.st_mode);
    return 0;
}

}  // namespace qixlator
