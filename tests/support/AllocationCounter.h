// Counts what the calling thread takes from the heap with operator new.
//
// Linking `test_allocation_counter` replaces the global operators of the program, so it is linked
// only where allocations are counted.
#pragma once

#include <cstddef>

namespace testing_support {

/// Counts from its construction on.
class AllocationCounter {
  public:
    AllocationCounter();
    std::size_t allocations() const;
    std::size_t releases() const;

  private:
    std::size_t allocationsBefore_;
    std::size_t releasesBefore_;
};

}  // namespace testing_support
