#include "Reading.h"
#include "unit/FailingAllocation.h"

extern "C" void* __real_realloc(void* memory, std::size_t size);

extern "C" void* __wrap_realloc(void* memory, std::size_t size) {
    return FailingAllocation::active ? nullptr : __real_realloc(memory, size);
}

namespace {

// An array of arrays, `depth` levels in all.
std::string nested(std::size_t depth) {
    return std::string(depth, '[') + std::string(depth, ']');
}

}  // namespace

TEST(JsonzAllocation, OnlyNestingDeeperThan4096LevelsNeedsMemory) {
    const std::string fits = nested(4096);
    const std::string tooDeep = nested(4097);
    const FailingAllocation failing;
    EXPECT_EQ(jsonz_readValue(fits.c_str(), nullptr), fits.c_str() + 8192);
    jsonz_value value;
    EXPECT_EQ(jsonz_readValue(tooDeep.c_str(), &value), nullptr);
    EXPECT_EQ(value.type, jsonz_typeFailure);
    EXPECT_EQ(value.position, nullptr);
    EXPECT_EQ(value.error, 0);
}
