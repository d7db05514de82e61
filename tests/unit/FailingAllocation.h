#pragma once

#include <cstddef>

// Puts a switch in front of an allocation function of C in this test program, which is linked with
// --wrap=<function>: while a FailingAllocation lives, every call fails.
class FailingAllocation {
  public:
    FailingAllocation() { active = true; }
    ~FailingAllocation() { active = false; }
    FailingAllocation(const FailingAllocation&) = delete;
    FailingAllocation& operator=(const FailingAllocation&) = delete;

    static inline bool active = false;
};
