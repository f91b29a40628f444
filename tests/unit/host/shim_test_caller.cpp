// A library that opens another one by its bare name, which only its own run path leads to.
#include <dlfcn.h>

extern "C" __attribute__((visibility("default"))) void *open_neighbour() {
    return dlopen("libvelkshim_test_library.so", RTLD_NOW);
}
