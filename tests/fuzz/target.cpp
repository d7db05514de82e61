// The fuzzer's entry point into the harness QITRMC_HARNESS. A finding ends the program.

#include <cstddef>
#include <cstdint>

#include "harnesses.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::QITRMC_HARNESS({reinterpret_cast<const char*>(data), size});
    return 0;
}
