// What each thread is throwing and catching, kept without asking for memory.
//
// The C++ run time keeps it in thread-local storage. That of a library which was loaded by name is
// taken from the heap when a thread throws for the first time, and when there is none left just
// then, which is when exceptions are thrown here, the C library ends the process. So a library that
// carries the run time inside replaces these two functions of it; the linker then leaves out the
// run time's own.
//
// The entries are laid out as the C++ ABI says. Source: Itanium C++ ABI, 2.2.2; Exception Handling
// ABI for the Arm Architecture, 8.3.
#include <cxxabi.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <cstdlib>

struct abi::__cxa_eh_globals {
    void* caughtExceptions = nullptr;
    unsigned uncaughtExceptions = 0;
#ifdef __ARM_EABI_UNWINDER__
    void* propagatingExceptions = nullptr;
#endif
};

namespace {

struct Entry {
    std::atomic<int> thread = 0;  // its kernel number; 0: free
    abi::__cxa_eh_globals globals;
};

// Threads alive that ever threw in this library. Each needs 16 or 24 bytes here for its life, and
// short memory is the only thing that these libraries throw for.
std::array<Entry, 256> entries;

int ownNumber() {
    return static_cast<int>(syscall(SYS_gettid));
}

bool isGone(int thread) {
    const int before = errno;
    const bool gone = syscall(SYS_tgkill, getpid(), thread, 0) != 0 && errno == ESRCH;
    errno = before;
    return gone;
}

Entry* find(int thread) {
    for (Entry& entry : entries)
        if (entry.thread.load(std::memory_order_relaxed) == thread) return &entry;
    return nullptr;
}

Entry* claim(int self, bool (*mayTake)(int)) {
    for (Entry& entry : entries) {
        int owner = entry.thread.load(std::memory_order_relaxed);
        if (!mayTake(owner)) continue;
        if (!entry.thread.compare_exchange_strong(owner, self)) continue;
        entry.globals = {};
        return &entry;
    }
    return nullptr;
}

Entry& own() {
    const int self = ownNumber();
    Entry* entry = find(self);
    if (entry == nullptr) entry = claim(self, [](int owner) { return owner == 0; });
    if (entry == nullptr) entry = claim(self, isGone);
    if (entry == nullptr) std::abort();
    return *entry;
}

}  // namespace

namespace __cxxabiv1 {

extern "C" __cxa_eh_globals* __cxa_get_globals() noexcept {
    return &own().globals;
}

extern "C" __cxa_eh_globals* __cxa_get_globals_fast() noexcept {
    return &own().globals;
}

}  // namespace __cxxabiv1
