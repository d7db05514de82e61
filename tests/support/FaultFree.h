#pragma once

// While it exists, the allocation faults of this thread are suspended, so that a stand-in is spared
// and only the code under test is affected. May nest.
class FaultFree {
  public:
    FaultFree() { ++depth; }
    ~FaultFree() { --depth; }
    FaultFree(const FaultFree&) = delete;
    FaultFree& operator=(const FaultFree&) = delete;

    static bool isActive() { return depth > 0; }

  private:
    static inline thread_local int depth = 0;
};
