#include <dirent.h>

#include <cerrno>
#include <cstdio>

#include "support/FaultyAllocator.h"

extern "C" {

std::FILE* __real_fopen(const char* path, const char* mode);
DIR* __real_opendir(const char* path);

std::FILE* __wrap_fopen(const char* path, const char* mode) {
    if (FaultyAllocator::nextFails()) {
        errno = ENOMEM;
        return nullptr;
    }
    return __real_fopen(path, mode);
}

DIR* __wrap_opendir(const char* path) {
    if (FaultyAllocator::nextFails()) {
        errno = ENOMEM;
        return nullptr;
    }
    return __real_opendir(path);
}

}  // extern "C"
