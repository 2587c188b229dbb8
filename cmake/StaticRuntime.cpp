// Linked into a library that carries the C++ run time inside: what that run time needs to feel at
// home in a library that is loaded on old panels, and unloaded again.
#include <cstdlib>
#include <new>

// The flag by which the C++ run time asks the C library whether atomic operations can be spared.
// The C library has it since 2.32 only. Defined here, out of sight, it keeps that version out of
// the library's needs; 0 says "there may be threads", which is always safe.
extern "C" [[gnu::visibility("hidden")]] char __libc_single_threaded;
char __libc_single_threaded = 0;

namespace __gnu_cxx {

// The run time's own names the exception on stderr before it ends the process, and brings the
// demangler along for that: a fifth of the plug-in. No exception leaves these libraries, and a
// panel has nobody who reads its stderr. Source: libsupc++/vterminate.cc, eh_term_handler.cc.
[[noreturn, gnu::visibility("hidden")]] void __verbose_terminate_handler();
void __verbose_terminate_handler() {
    std::abort();
}

// Source: libsupc++/eh_alloc.cc, where it serves memory checkers.
void __freeres();
}  // namespace __gnu_cxx

// What the standard library's templates call to throw. A guard at the library's border catches
// everything alike, so one exception does for all of them; the run time's own bring a text
// formatter and a family of exceptions with their strings along, 4 KiB that nobody can tell apart.
// Source: libstdc++-v3/src/c++11/functexcept.cc, system_error.cc.
namespace std {

[[noreturn, gnu::visibility("hidden")]] void __throw_bad_alloc() {
    throw bad_alloc();
}
[[noreturn, gnu::visibility("hidden")]] void __throw_bad_array_new_length() {
    throw bad_alloc();
}
[[noreturn, gnu::visibility("hidden")]] void __throw_length_error(const char* /*where*/) {
    throw bad_alloc();
}
[[noreturn, gnu::visibility("hidden")]] void __throw_logic_error(const char* /*where*/) {
    throw bad_alloc();
}
[[noreturn, gnu::visibility("hidden")]] void __throw_out_of_range_fmt(const char* /*where*/, ...) {
    throw bad_alloc();
}
[[noreturn, gnu::visibility("hidden")]] void __throw_system_error(int /*code*/) {
    throw bad_alloc();
}

}  // namespace std

namespace {

// Each copy of the run time takes some memory aside, when it is loaded, for exceptions thrown when
// there is none, and counts on the end of the process to give it back: 20 KiB lost with every
// unloading on 32-bit ARM, 70 KiB on x86-64. The priority is that of the factory in plugin/, and so
// behind every destructor of the library.
[[gnu::destructor(101)]] void giveBackReserve() {
    __gnu_cxx::__freeres();
}

}  // namespace
