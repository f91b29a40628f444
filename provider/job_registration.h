// Registration of a request's job with the host's job library.
#pragma once

#include <cstddef>

namespace velk {

// What the job library is told: where the status of the job can be asked for and cleaned up.
// Terminated texts; the record is zero-filled before use.
struct JobRegistration {
    static constexpr std::size_t kFieldSize = 256;

    char provider_name[kFieldSize];
    char library_path[kFieldSize];
    char status_function[kFieldSize];
    char cleanup_function[kFieldSize];
};
static_assert(sizeof(JobRegistration) == 1024);

// Has the job library create a job and name it in `instanceID`. An attempt that fails is repeated
// after 12 seconds, four times; the last one is waited for as well. Returns false when all failed.
bool register_job();

}  // namespace velk
