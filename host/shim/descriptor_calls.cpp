// The calls that open and close descriptors: open, creat, close, opendir and their relatives.
#include <cstdarg>

#include "host/shim/device_opens.h"
#include "host/shim/libc_calls.h"
#include "host/shim/on_path.h"
#include "host/shim/open_files.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

bool takes_a_mode(int flags) {
    return (flags & O_CREAT) != 0 || (flags & O_TMPFILE) == O_TMPFILE;
}

template <typename OpenCall>
int open_descriptor(const char *path, int flags, OpenCall open_call) {
    const Rerooted target(path);
    if (const int error = target.refusal("open"); error != 0) {
        return fail_with<int>(error);
    }
    if (const auto device = open_device(target, flags)) {
        return *device;
    }
    const int descriptor = open_call(target.path());
    remember_open(descriptor, target, purpose_of(flags));
    return descriptor;
}

int open_narrow(const char *path, int flags, mode_t mode = 0) {
    return open_descriptor(path, flags,
                           [=](const char *real) { return libc().open(real, flags, mode); });
}

int open_wide(const char *path, int flags, mode_t mode = 0) {
    return open_descriptor(path, flags,
                           [=](const char *real) { return libc().open64(real, flags, mode); });
}

int openat_narrow(int folder, const char *path, int flags, mode_t mode = 0) {
    return open_descriptor(
        path, flags, [=](const char *real) { return libc().openat(folder, real, flags, mode); });
}

int openat_wide(int folder, const char *path, int flags, mode_t mode = 0) {
    return open_descriptor(
        path, flags, [=](const char *real) { return libc().openat64(folder, real, flags, mode); });
}

// The result of a close that a fault shall let fail: as with the kernel's own errors, the
// descriptor is gone all the same.
int closed(const Closing &closing, std::string_view verb, int result) {
    const int error = result == 0 ? closing.fault(verb) : 0;
    return error == 0 ? result : fail_with<int>(error);
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

// The mode is a variable argument, read only where the flags ask for it.
#define VELKSHIM_READ_MODE(flags, mode)   \
    mode_t mode = 0;                      \
    if (shim::takes_a_mode(flags)) {      \
        va_list arguments;                \
        va_start(arguments, flags);       \
        mode = va_arg(arguments, mode_t); \
        va_end(arguments);                \
    }                                     \
    static_assert(true, "takes a semicolon")

extern "C" {

VELKSHIM_API int open(const char *path, int flags, ...) {
    VELKSHIM_READ_MODE(flags, mode);
    return shim::open_narrow(path, flags, mode);
}

VELKSHIM_API int open64(const char *path, int flags, ...) {
    VELKSHIM_READ_MODE(flags, mode);
    return shim::open_wide(path, flags, mode);
}

VELKSHIM_API int openat(int folder, const char *path, int flags, ...) {
    VELKSHIM_READ_MODE(flags, mode);
    return shim::openat_narrow(folder, path, flags, mode);
}

VELKSHIM_API int openat64(int folder, const char *path, int flags, ...) {
    VELKSHIM_READ_MODE(flags, mode);
    return shim::openat_wide(folder, path, flags, mode);
}

// What the calls above become in programs compiled with _FORTIFY_SOURCE.
// NOLINTBEGIN(bugprone-reserved-identifier): libc's own names
VELKSHIM_API int __open_2(const char *path, int flags) {
    return shim::open_narrow(path, flags);
}

VELKSHIM_API int __open64_2(const char *path, int flags) {
    return shim::open_wide(path, flags);
}

VELKSHIM_API int __openat_2(int folder, const char *path, int flags) {
    return shim::openat_narrow(folder, path, flags);
}

VELKSHIM_API int __openat64_2(int folder, const char *path, int flags) {
    return shim::openat_wide(folder, path, flags);
}
// NOLINTEND(bugprone-reserved-identifier)

VELKSHIM_API int creat(const char *path, mode_t mode) {
    return shim::open_narrow(path, O_WRONLY | O_CREAT | O_TRUNC, mode);
}

VELKSHIM_API int creat64(const char *path, mode_t mode) {
    return shim::open_wide(path, O_WRONLY | O_CREAT | O_TRUNC, mode);
}

VELKSHIM_API int close(int descriptor) {
    const shim::Closing closing(descriptor);
    shim::forget_device(descriptor);
    return shim::closed(closing, "close", shim::libc().close(descriptor));
}

VELKSHIM_API DIR *opendir(const char *path) {
    const shim::Rerooted target(path);
    if (const int error = target.refusal("opendir"); error != 0) {
        return shim::fail_with<DIR *>(error);
    }
    DIR *const folder = shim::libc().opendir(target.path());
    shim::remember_open(folder == nullptr ? -1 : dirfd(folder), target, shim::OpenedFor::kListing);
    return folder;
}

VELKSHIM_API int closedir(DIR *folder) {
    const shim::Closing closing(folder == nullptr ? -1 : dirfd(folder));
    return shim::closed(closing, "closedir", shim::libc().closedir(folder));
}

}  // extern "C"
