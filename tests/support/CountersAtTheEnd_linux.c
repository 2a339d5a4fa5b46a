/* Linked into all that is built for coverage: writes the counters of a process that ends without an exit, as a trap, a
 * fatal error and the children of many tests do. The linker calls these in the place of the functions they are named
 * for (cmake/CompileOptions.cmake). */

#include <stdlib.h>
#include <unistd.h>

void __gcov_dump(void);
int __real_raise(int signal);
void __real__Exit(int status) __attribute__((noreturn));
void __real__exit(int status) __attribute__((noreturn));

int __wrap_raise(int signal);
void __wrap__Exit(int status) __attribute__((noreturn));
void __wrap__exit(int status) __attribute__((noreturn));

int __wrap_raise(int signal) {
    __gcov_dump();
    return __real_raise(signal);
}

void __wrap__Exit(int status) {
    __gcov_dump();
    __real__Exit(status);
}

void __wrap__exit(int status) {
    __gcov_dump();
    __real__exit(status);
}
