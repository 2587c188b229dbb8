// Refuses the calling thread's requests for memory when told.
//
// Linking `test_memory_shortage` replaces the global operators of the program and the calls of
// malloc() in what is linked into it, so it is linked only where memory is to run short.
#pragma once

namespace testing_support {

/// While it lives only `requests` more requests of operator new and malloc() are granted. One at a
/// time.
class MemoryShortage {
  public:
    explicit MemoryShortage(int requests = 0);
    ~MemoryShortage();
    MemoryShortage(const MemoryShortage&) = delete;
    MemoryShortage& operator=(const MemoryShortage&) = delete;
};

}  // namespace testing_support
