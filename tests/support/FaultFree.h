#pragma once

// Keeps the allocation faults of this thread away from a stand-in while it works, so that they
// strike the code under test alone. May nest.
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
