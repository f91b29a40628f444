// The machine's own time, whatever clock the process shows to what it hosts.
#pragma once

#include <sys/syscall.h>
#include <unistd.h>

#include <cstdint>
#include <ctime>

namespace velkhost::cimxml {

// Milliseconds since some start. Not through libc, whose calls may be those of a virtual clock.
inline std::int64_t machine_ms() {
    timespec now{};
    syscall(SYS_clock_gettime, CLOCK_MONOTONIC, &now);
    return std::int64_t{now.tv_sec} * 1000 + now.tv_nsec / 1'000'000;
}

}  // namespace velkhost::cimxml
