/* Whoever loads this library is gone. */
#include <stdlib.h>

int other(void);

int other(void) {
    return 1;
}

#ifdef WITH_ENTRY
/* Hidden unless asked for: the build hides all names. */
void* GetInterfaceFactory(void);

__attribute__((visibility("default"))) void* GetInterfaceFactory(void) {
    return 0;
}
#endif

__attribute__((constructor)) static void leave(void) {
    _Exit(99);
}
