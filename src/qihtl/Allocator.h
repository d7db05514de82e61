#pragma once

#include <cstddef>
#include <cstdint>

#include "qierr/Status.h"

// The one door through which the translation layers, their Lua states included, get heap memory.
//
// realloc with a plain meaning for size 0: the block is freed and null returned. Null when memory
// runs out; the old block then stands. Any thread. Defined in a source file of its own, so that a
// fault test can link a definition that fails on purpose.
void* qihtl_realloc(void* pointer, std::size_t size);

// Reports that memory ran out: code qiapalerr_memoryFull at the position of this header.
inline void qihtl_reportMemoryFull(qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_memoryFull,
                              QIERR_HERE_NAMED("qiapalerr_memoryFull"));
}

// The capacity to grow to when `needed` elements do not fit: half as much again, at least 8, at
// least `needed`. 0 when that many elements of `elementSize` bytes overflow 32 bits of bytes.
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
