// The calls that pause and that tell the time.
#include <sys/time.h>

#include <cerrno>

#include "host/shim/hook.h"
#include "host/shim/libc_calls.h"
#include "host/shim/velkshim.h"
#include "host/shim/virtual_clock.h"

namespace velkhost::shim {
namespace {

constexpr std::int64_t kMicrosPerSecond = 1'000'000;

// What the virtual clock's monotonic times count from: nothing in the past is before time zero.
constexpr std::int64_t kUptimeAtStart = 3600 * kMicrosPerSecond;

constinit Hook<void(void *, int64_t, int64_t)> pause_observer;

// A time in the pieces that timeval and timespec want; the second one is never negative.
struct Split {
    std::int64_t seconds;
    std::int64_t micros;
};

Split split(std::int64_t time_us) {
    std::int64_t seconds = time_us / kMicrosPerSecond;
    std::int64_t micros = time_us % kMicrosPerSecond;
    if (micros < 0) {
        --seconds;
        micros += kMicrosPerSecond;
    }
    return {seconds, micros};
}

timespec to_timespec(std::int64_t time_us) {
    const Split parts = split(time_us);
    return {static_cast<time_t>(parts.seconds), static_cast<long>(parts.micros * 1000)};
}

// Upwards: a pause is never shorter than asked for.
std::int64_t to_micros(const timespec &time) {
    return time.tv_sec * kMicrosPerSecond + (time.tv_nsec + 999) / 1000;
}

bool is_wall_clock(clockid_t clock) {
    return clock == CLOCK_REALTIME || clock == CLOCK_REALTIME_COARSE;
}

bool is_monotonic(clockid_t clock) {
    return clock == CLOCK_MONOTONIC || clock == CLOCK_MONOTONIC_COARSE ||
           clock == CLOCK_MONOTONIC_RAW || clock == CLOCK_BOOTTIME;
}

// CPU-time clocks stay the machine's.
bool is_virtual(clockid_t clock) {
    return virtual_clock.is_running() && (is_wall_clock(clock) || is_monotonic(clock));
}

std::int64_t virtual_time_us(clockid_t clock) {
    return is_wall_clock(clock) ? virtual_clock.now_us()
                                : kUptimeAtStart + virtual_clock.elapsed_us();
}

void announce(std::int64_t length_us) {
    if (pause_observer.is_set()) {
        pause_observer(velkshim_now_us(), length_us);
    }
}

bool is_valid(const timespec &time) {
    return time.tv_sec >= 0 && time.tv_nsec >= 0 && time.tv_nsec < 1'000'000'000;
}

// A pause of the virtual clock, with nanosleep's way of telling what a signal left of it. Returns
// 0 or an errno value.
int pause_virtually(std::int64_t length_us, timespec *left) {
    const std::int64_t left_us = virtual_clock.pause(length_us);
    if (left_us == 0) {
        return 0;
    }
    if (left != nullptr) {
        *left = to_timespec(left_us);
    }
    return EINTR;
}

// The same as a result of -1 with errno, which stays as it is otherwise.
int result_of(int error) {
    if (error == 0) {
        return 0;
    }
    errno = error;
    return -1;
}

int sleep_until(clockid_t clock, const timespec &time) {
    const std::int64_t length_us = to_micros(time) - virtual_time_us(clock);
    announce(length_us > 0 ? length_us : 0);
    return pause_virtually(length_us, nullptr);
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API unsigned int sleep(unsigned int seconds) {
    const std::int64_t length_us = seconds * shim::kMicrosPerSecond;
    shim::announce(length_us);
    if (!shim::virtual_clock.is_running()) {
        return shim::libc().sleep(seconds);
    }
    const std::int64_t left_us = shim::virtual_clock.pause(length_us);
    return static_cast<unsigned int>((left_us + shim::kMicrosPerSecond - 1) /
                                     shim::kMicrosPerSecond);
}

VELKSHIM_API int usleep(useconds_t micros) {
    shim::announce(micros);
    if (!shim::virtual_clock.is_running()) {
        return shim::libc().usleep(micros);
    }
    return shim::result_of(shim::pause_virtually(micros, nullptr));
}

VELKSHIM_API int nanosleep(const timespec *length, timespec *left) {
    if (length == nullptr || !shim::is_valid(*length)) {
        return shim::libc().nanosleep(length, left);  // for its errno
    }
    shim::announce(shim::to_micros(*length));
    if (!shim::virtual_clock.is_running()) {
        return shim::libc().nanosleep(length, left);
    }
    return shim::result_of(shim::pause_virtually(shim::to_micros(*length), left));
}

VELKSHIM_API int clock_nanosleep(clockid_t clock, int flags, const timespec *time, timespec *left) {
    if (time == nullptr || !shim::is_valid(*time) || !shim::is_virtual(clock)) {
        return shim::libc().clock_nanosleep(clock, flags, time, left);
    }
    if ((flags & TIMER_ABSTIME) != 0) {
        return shim::sleep_until(clock, *time);
    }
    shim::announce(shim::to_micros(*time));
    return shim::pause_virtually(shim::to_micros(*time), left);
}

VELKSHIM_API time_t time(time_t *out) noexcept {
    if (!shim::virtual_clock.is_running()) {
        return shim::libc().time(out);
    }
    const auto seconds = static_cast<time_t>(shim::split(shim::virtual_clock.now_us()).seconds);
    if (out != nullptr) {
        *out = seconds;
    }
    return seconds;
}

VELKSHIM_API int gettimeofday(timeval *out, void *zone) noexcept {
    const int result = shim::libc().gettimeofday(out, zone);
    if (result == 0 && out != nullptr && shim::virtual_clock.is_running()) {
        const shim::Split parts = shim::split(shim::virtual_clock.now_us());
        *out = {static_cast<time_t>(parts.seconds), static_cast<suseconds_t>(parts.micros)};
    }
    return result;
}

VELKSHIM_API int clock_gettime(clockid_t clock, timespec *out) noexcept {
    if (out == nullptr || !shim::is_virtual(clock)) {
        return shim::libc().clock_gettime(clock, out);
    }
    *out = shim::to_timespec(shim::virtual_time_us(clock));
    return 0;
}

}  // extern "C"

// ---- The shim's own interface ----

void velkshim_use_virtual_clock(int64_t epoch_us) {
    shim::virtual_clock.start(epoch_us);
}

void velkshim_use_real_clock(void) {
    shim::virtual_clock.stop();
}

int64_t velkshim_now_us(void) {
    if (shim::virtual_clock.is_running()) {
        return shim::virtual_clock.now_us();
    }
    timespec now{};
    shim::libc().clock_gettime(CLOCK_REALTIME, &now);
    return now.tv_sec * shim::kMicrosPerSecond + now.tv_nsec / 1000;
}

void velkshim_observe_pauses(velkshim_pause_observer observer, void *context) {
    shim::pause_observer.set(observer, context);
}
