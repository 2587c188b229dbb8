/* Whoever loads this library is gone. */
#include <stdlib.h>

int other(void);

int other(void) {
    return 1;
}

__attribute__((constructor)) static void leave(void) {
    _Exit(99);
}
