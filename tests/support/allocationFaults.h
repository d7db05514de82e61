#pragma once

// Makes allocations of this thread fail: malloc, calloc and realloc where the test program's own
// code calls them (it is linked with --wrap for each), and operator new everywhere. Stand-ins that
// hold a FaultFree are exempt.
class AllocationFault {
  public:
    enum class Extent { One, AllFromThere };

    // The first `successes` allocations from now on work, the next fails.
    AllocationFault(int successes, Extent extent);
    // Allocations work again.
    ~AllocationFault();
    AllocationFault(const AllocationFault&) = delete;
    AllocationFault& operator=(const AllocationFault&) = delete;

    // Whether an allocation has failed.
    bool hasStruck() const;
};
