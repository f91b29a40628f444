#include "provider/job_registration.h"

#include <dlfcn.h>
#include <unistd.h>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

namespace velk {
namespace {

constexpr const char *kJobLibrary = "/usr/lib/cim/libconcretejob.so";
constexpr const char *kOwnLibrary = "/usr/lib/cim/libvelkprovider.so";
constexpr int kAttempts = 5;
constexpr unsigned kPauseSeconds = 12;

using CreateJobInstance = int (*)(char *instance_id, int size, JobRegistration *registration);

JobRegistration make_registration() {
    JobRegistration registration = {};
    copy(registration.provider_name, "VELK");
    copy(registration.library_path, kOwnLibrary);
    copy(registration.status_function, "getVELKStatus");
    copy(registration.cleanup_function, "VELKStatusCleanup");
    return registration;
}

bool create_job(void *library, JobRegistration &registration) {
    void *symbol = dlsym(library, "create_job_instance");
    if (symbol == nullptr) {
        return false;
    }
    log_entry("dlsym successfully.\n");
    const auto create = reinterpret_cast<CreateJobInstance>(symbol);
    const int result = create(instanceID, static_cast<int>(sizeof instanceID), &registration);
    instanceID[sizeof instanceID - 1] = '\0';
    return result == 0;
}

bool attempt(JobRegistration &registration) {
    bool created = false;
    void *library = dlopen(kJobLibrary, RTLD_LAZY);
    if (library != nullptr) {
        log_entry("dlopen successfully.\n");
        created = create_job(library, registration);
        dlclose(library);
    }
    log_format("instanceID is = %s\n", instanceID);
    return created;
}

}  // namespace

bool register_job() {
    JobRegistration registration = make_registration();
    for (int i = 0; i < kAttempts; ++i) {
        if (attempt(registration)) {
            return true;
        }
        sleep(kPauseSeconds);
    }
    return false;
}

}  // namespace velk
