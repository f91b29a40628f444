// The job library's C interface: what a provider hands over to have a job made.
#pragma once

#include <cstddef>

#ifdef __cplusplus
extern "C" {
#endif

// Terminated texts, none of them empty.
struct JobRegistration {
    char provider_name[256];     // begins the ids of the provider's jobs
    char library_path[256];      // the library that holds the two functions
    char status_function[256];   // int (const char *instance_id, int *job_state, char *message,
                                 // int message_size)
    char cleanup_function[256];  // int (const char *instance_id)
};

// Makes a job whose state the status function tells, and writes its id to `instance_id`, a buffer
// of `size` bytes: the provider's name, "-" and a number that counts the jobs of the process.
//
// The status function is first called 10 seconds later and then every 10 seconds until it has told
// a state that ends (7, 8, 9 or 10 of CIM_ConcreteJob.JobState); after that at each read of the
// job's instance, and before the job goes out of date. It gets the present state and text, the text
// in a buffer of 4096 bytes, changes what it knows better, and returns 0; anything else means that
// it knows nothing. The clean-up function is called once, when the job is deleted or out of date.
// Both are called on threads of any kind, several calls may overlap, and their library stays loaded
// as long as the job.
//
// Returns 0, or an errno value and no job: EINVAL for a null argument and for a field that is
// empty or not terminated, ERANGE when the id does not fit, EAGAIN without a thread, ENOMEM; or
// the status of a fault that the scenario sets.
__attribute__((visibility("default"))) int create_job_instance(
    char *instance_id, int size, struct JobRegistration *registration);

#ifdef __cplusplus
}

static_assert(sizeof(JobRegistration) == 1024);
static_assert(offsetof(JobRegistration, library_path) == 256);
static_assert(offsetof(JobRegistration, status_function) == 512);
static_assert(offsetof(JobRegistration, cleanup_function) == 768);
#endif
