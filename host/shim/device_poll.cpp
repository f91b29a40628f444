#include "host/shim/device_poll.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <vector>

#include "host/shim/device_opens.h"
#include "host/shim/libc_calls.h"
#include "host/shim/velkshim.h"
#include "host/shim/virtual_clock.h"

namespace velkhost::shim {
namespace {

constexpr std::int64_t kMicrosPerMilli = 1'000;
constexpr std::int64_t kMicrosPerSecond = 1'000'000;
constexpr std::int64_t kNever = std::numeric_limits<std::int64_t>::max();

// The other threads of the process may send on the same descriptor, and other descriptors have a
// life of their own: nobody tells, so one looks again at latest after this time.
constexpr std::int64_t kLookAgainUs = 10'000;

bool is_device(const DeviceAccess &access, int descriptor) {
    return access.client(descriptor) != nullptr;
}

std::int64_t deadline_us(int timeout_ms) {
    return timeout_ms < 0 ? kNever : velkshim_now_us() + timeout_ms * kMicrosPerMilli;
}

// Like the driver's, a device is readable or nothing.
int look_at_devices(const DeviceAccess &access, std::span<pollfd> set) {
    int ready = 0;
    for (pollfd &entry : set) {
        const auto client = access.client(entry.fd);
        if (client == nullptr) {
            continue;
        }
        const int readable = client->empty() ? 0 : POLLIN | POLLRDNORM;
        entry.revents = static_cast<short>(readable & entry.events);
        ready += entry.revents != 0 ? 1 : 0;
    }
    return ready;
}

// libc ignores negative descriptors.
int look_at_others(const DeviceAccess &access, std::span<pollfd> set) {
    std::vector<pollfd> others(set.begin(), set.end());
    for (pollfd &entry : others) {
        entry.fd = is_device(access, entry.fd) ? -1 : entry.fd;
    }
    const int ready = libc().poll(others.data(), others.size(), 0);
    for (std::size_t i = 0; i < others.size(); ++i) {
        if (others[i].fd >= 0) {
            set[i].revents = others[i].revents;
        }
    }
    return ready;
}

// Returns whether the wait went through; not where a signal handler ended it.
bool pause_for(std::int64_t length_us) {
    if (virtual_clock.is_running()) {
        return virtual_clock.pause(length_us) == 0;
    }
    const timespec length = {static_cast<time_t>(length_us / kMicrosPerSecond),
                             static_cast<long>(length_us % kMicrosPerSecond * 1'000)};
    return libc().nanosleep(&length, nullptr) == 0;
}

struct Look {
    int ready = 0;
    std::int64_t now_us = 0;
    std::int64_t next_us = kNever;  // when to look again
};

Look look(std::span<pollfd> set) {
    const DeviceAccess access;
    const int others = look_at_others(access, set);
    const int devices = look_at_devices(access, set);
    const std::int64_t due = access.driver().next_us().value_or(kNever);
    return {others < 0 ? others : others + devices, access.now_us(),
            std::min(due, access.now_us() + kLookAgainUs)};
}

bool has_device(std::span<pollfd> set) {
    if (!device_is_open()) {
        return false;
    }
    const DeviceAccess access;
    return std::ranges::any_of(set,
                               [&](const pollfd &entry) { return is_device(access, entry.fd); });
}

}  // namespace

std::optional<int> poll_devices(std::span<pollfd> set, int timeout_ms) {
    if (!has_device(set)) {
        return std::nullopt;
    }
    const std::int64_t deadline = deadline_us(timeout_ms);
    for (;;) {
        const Look seen = look(set);
        if (seen.ready != 0 || seen.now_us >= deadline) {
            return seen.ready;
        }
        if (!pause_for(std::min(seen.next_us, deadline) - seen.now_us)) {
            errno = EINTR;
            return -1;
        }
    }
}

}  // namespace velkhost::shim
