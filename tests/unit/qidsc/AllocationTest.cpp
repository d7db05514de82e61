#include <gtest/gtest.h>

#include <new>

#include "qi/dsc/WideString.h"
#include "unit/FailingAllocation.h"

extern "C" void* __real_malloc(std::size_t size);

extern "C" void* __wrap_malloc(std::size_t size) {
    return FailingAllocation::active ? nullptr : __real_malloc(size);
}

namespace {

bool refused() {
    const FailingAllocation failing;
    try {
        qi::dsc::WideString string("Call");
    } catch (const std::bad_alloc&) {
        return true;
    }
    return false;
}

}  // namespace

TEST(WideStringAllocation, FailureThrowsBadAlloc) {
    EXPECT_TRUE(refused());
}
