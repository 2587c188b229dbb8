/* The flag by which the C++ run time asks the C library whether atomic operations can be spared.
 * The C library has it since 2.32 only, and a library that carries the C++ run time would ask for
 * it by that version. Defined here, out of sight, it lets the library load on older panels; the
 * constant 0 says "there may be threads", which is always safe. */
__attribute__((visibility("hidden"))) char __libc_single_threaded = 0;
