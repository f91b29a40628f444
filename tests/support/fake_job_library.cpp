// A job library for the tests of its caller: what it is asked goes to the test program.
#include <dlfcn.h>

#include <cstddef>

using CreateJob = int (*)(char *instance_id, int size, const void *registration);

extern "C" [[gnu::visibility("default")]] int create_job_instance(char *instance_id, int size,
                                                                  const void *registration) {
    void *symbol = dlsym(RTLD_DEFAULT, "velktest_create_job");
    return symbol == nullptr ? -1
                             : reinterpret_cast<CreateJob>(symbol)(instance_id, size, registration);
}
