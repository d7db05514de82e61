#pragma once

#include <cstddef>

// Replaces an allocation function of C in this test program, which is linked with
// --wrap=<function>: while a FailingAllocation exists, every call fails.
class FailingAllocation {
  public:
    FailingAllocation() { active = true; }
    ~FailingAllocation() { active = false; }
    FailingAllocation(const FailingAllocation&) = delete;
    FailingAllocation& operator=(const FailingAllocation&) = delete;

    static inline bool active = false;
};
