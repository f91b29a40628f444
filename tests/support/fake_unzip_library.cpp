// An unzip library for the tests of its caller: what it is asked goes to the test program.
#include <dlfcn.h>

extern "C" [[gnu::visibility("default")]] int Minizip(const char *archive, const char *directory) {
    using Unzip = int (*)(const char *, const char *);
    void *symbol = dlsym(RTLD_DEFAULT, "velktest_minizip");
    return symbol == nullptr ? -1 : reinterpret_cast<Unzip>(symbol)(archive, directory);
}
