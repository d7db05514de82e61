#include <dirent.h>

#include <cerrno>
#include <cstdio>

#include "support/FaultyAllocator.h"

extern "C" {

// The name of fopen where files are counted in 64 bits.
std::FILE* __real_fopen64(const char* path, const char* mode);
DIR* __real_opendir(const char* path);

std::FILE* __wrap_fopen64(const char* path, const char* mode) {
    if (FaultyAllocator::nextFails()) {
        errno = ENOMEM;
        return nullptr;
    }
    return __real_fopen64(path, mode);
}

DIR* __wrap_opendir(const char* path) {
    if (FaultyAllocator::nextFails()) {
        errno = ENOMEM;
        return nullptr;
    }
    return __real_opendir(path);
}

}  // extern "C"
