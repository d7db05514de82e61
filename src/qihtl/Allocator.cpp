#include "qihtl/Allocator.h"

#include <cstdlib>

void* qihtl_realloc(void* pointer, std::size_t size) {
    if (size == 0) {
        std::free(pointer);
        return nullptr;
    }
    return std::realloc(pointer, size);
}
