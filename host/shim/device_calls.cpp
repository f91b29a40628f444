// The calls on descriptors that may be the IPMI device: ioctl, poll and the dup family. Every other
// descriptor is libc's affair.
#include <poll.h>
#include <sys/ioctl.h>

#include <cerrno>
#include <cstdarg>

#include "host/shim/device_controls.h"
#include "host/shim/device_opens.h"
#include "host/shim/device_poll.h"
#include "host/shim/libc_calls.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

// The errno value of a control call on a device; no value for any other descriptor.
std::optional<int> control(int descriptor, unsigned long code, void *argument) {
    if (!device_is_open()) {
        return std::nullopt;
    }
    const DeviceAccess access;
    const auto client = access.client(descriptor);
    return client == nullptr ? std::nullopt
                             : std::optional(control_device(access, client, code, argument));
}

int poll_set(pollfd *set, nfds_t count, int timeout_ms) {
    if (set != nullptr) {
        if (const auto ready = poll_devices({set, count}, timeout_ms)) {
            return *ready;
        }
    }
    return libc().poll(set, count, timeout_ms);
}

int copied(int descriptor, int copy) {
    copy_device(descriptor, copy);
    return copy;
}

bool copies(int command) {
    return command == F_DUPFD || command == F_DUPFD_CLOEXEC;
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

// The argument is handed on as a pointer, as libc itself does it.
#define VELKSHIM_READ_ARGUMENT(last, argument)  \
    va_list arguments;                          \
    va_start(arguments, last);                  \
    void *argument = va_arg(arguments, void *); \
    va_end(arguments)

extern "C" {

VELKSHIM_API int ioctl(int descriptor, unsigned long code, ...) noexcept {
    VELKSHIM_READ_ARGUMENT(code, argument);
    const auto error = shim::control(descriptor, code, argument);
    if (!error) {
        return shim::libc().ioctl(descriptor, code, argument);
    }
    errno = *error == 0 ? errno : *error;
    return *error == 0 ? 0 : -1;
}

VELKSHIM_API int poll(pollfd *set, nfds_t count, int timeout_ms) {
    return shim::poll_set(set, count, timeout_ms);
}

// What poll becomes in programs compiled with _FORTIFY_SOURCE.
// NOLINTNEXTLINE(bugprone-reserved-identifier): libc's own name
VELKSHIM_API int __poll_chk(pollfd *set, nfds_t count, int timeout_ms, size_t size) {
    if (size / sizeof(pollfd) < count) {
        return shim::libc().poll_chk(set, count, timeout_ms, size);  // ends the process
    }
    return shim::poll_set(set, count, timeout_ms);
}

VELKSHIM_API int dup(int descriptor) noexcept {
    return shim::copied(descriptor, shim::libc().dup(descriptor));
}

VELKSHIM_API int dup2(int descriptor, int copy) noexcept {
    return shim::copied(descriptor, shim::libc().dup2(descriptor, copy));
}

VELKSHIM_API int dup3(int descriptor, int copy, int flags) noexcept {
    return shim::copied(descriptor, shim::libc().dup3(descriptor, copy, flags));
}

VELKSHIM_API int fcntl(int descriptor, int command, ...) {
    VELKSHIM_READ_ARGUMENT(command, argument);
    const int result = shim::libc().fcntl(descriptor, command, argument);
    return shim::copies(command) ? shim::copied(descriptor, result) : result;
}

VELKSHIM_API int fcntl64(int descriptor, int command, ...) {
    VELKSHIM_READ_ARGUMENT(command, argument);
    const int result = shim::libc().fcntl64(descriptor, command, argument);
    return shim::copies(command) ? shim::copied(descriptor, result) : result;
}

}  // extern "C"
