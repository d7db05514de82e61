// Folder qihtl: strings and arrays that report a failed allocation in a status, without exceptions.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qierr/Status.h"

// The only allocation function of the translation layers, Lua states included.
//
// Works like realloc, but size 0 always frees the block and returns null. If memory runs out, it
// returns null and the old block remains valid. Any thread may call it. It is defined in a source
// file of its own, so that tests can link a definition that fails on purpose.
void* qihtl_realloc(void* pointer, std::size_t size);

// Reports that memory ran out: qiapalerr_memoryFull, with the position of this line.
inline void qihtl_reportMemoryFull(qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_memoryFull,
                              QIERR_HERE_NAMED("qiapalerr_memoryFull"));
}

// The new capacity if `needed` elements do not fit: one and a half times the old one, but at least
// 8 and at least `needed`. 0 if the size in bytes would exceed 0x7FFFFFFF.
inline std::uint32_t qihtl_grownCapacity(std::uint32_t capacity, std::uint64_t needed,
                                         std::size_t elementSize) {
    const std::uint64_t limit = 0x7FFFFFFFu / elementSize;
    std::uint64_t grown = std::uint64_t{capacity} + capacity / 2;
    grown = grown < 8 ? 8 : grown;
    if (grown < needed || grown > limit) {
        grown = needed;
    }
    return grown > limit ? 0 : static_cast<std::uint32_t>(grown);
}
