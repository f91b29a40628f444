// The calls that ask about names: access, readlink and the stat family.
#include "host/shim/libc_calls.h"
#include "host/shim/on_path.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

int stat_narrow(const char *path, struct stat *status) noexcept {
    return on_path("stat", path, [=](const char *real) { return libc().stat(real, status); });
}

int stat_wide(const char *path, struct stat64 *status) noexcept {
    return on_path("stat", path, [=](const char *real) { return libc().stat64(real, status); });
}

int lstat_narrow(const char *path, struct stat *status) noexcept {
    return on_path("lstat", path, [=](const char *real) { return libc().lstat(real, status); });
}

int lstat_wide(const char *path, struct stat64 *status) noexcept {
    return on_path("lstat", path, [=](const char *real) { return libc().lstat64(real, status); });
}

int fstatat_narrow(int folder, const char *path, struct stat *status, int flags) noexcept {
    return on_path("stat", path,
                   [=](const char *real) { return libc().fstatat(folder, real, status, flags); });
}

int fstatat_wide(int folder, const char *path, struct stat64 *status, int flags) noexcept {
    return on_path("stat", path,
                   [=](const char *real) { return libc().fstatat64(folder, real, status, flags); });
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API int access(const char *path, int mode) noexcept {
    return shim::on_path("access", path,
                         [mode](const char *real) { return shim::libc().access(real, mode); });
}

VELKSHIM_API int faccessat(int folder, const char *path, int mode, int flags) noexcept {
    return shim::on_path("access", path, [=](const char *real) {
        return shim::libc().faccessat(folder, real, mode, flags);
    });
}

VELKSHIM_API ssize_t readlink(const char *path, char *out, size_t size) noexcept {
    return shim::on_path("readlink", path,
                         [=](const char *real) { return shim::libc().readlink(real, out, size); });
}

VELKSHIM_API ssize_t readlinkat(int folder, const char *path, char *out, size_t size) noexcept {
    return shim::on_path("readlink", path, [=](const char *real) {
        return shim::libc().readlinkat(folder, real, out, size);
    });
}

VELKSHIM_API int stat(const char *path, struct stat *status) noexcept {
    return shim::stat_narrow(path, status);
}

VELKSHIM_API int stat64(const char *path, struct stat64 *status) noexcept {
    return shim::stat_wide(path, status);
}

VELKSHIM_API int lstat(const char *path, struct stat *status) noexcept {
    return shim::lstat_narrow(path, status);
}

VELKSHIM_API int lstat64(const char *path, struct stat64 *status) noexcept {
    return shim::lstat_wide(path, status);
}

VELKSHIM_API int fstatat(int folder, const char *path, struct stat *status, int flags) noexcept {
    return shim::fstatat_narrow(folder, path, status, flags);
}

VELKSHIM_API int fstatat64(int folder, const char *path, struct stat64 *status,
                           int flags) noexcept {
    return shim::fstatat_wide(folder, path, status, flags);
}

VELKSHIM_API int statx(int folder, const char *path, int flags, unsigned int mask,
                       struct statx *status) noexcept {
    return shim::on_path("stat", path, [=](const char *real) {
        return shim::libc().statx(folder, real, flags, mask, status);
    });
}

// The same calls in binaries built against glibc before 2.33, which pass the version of the
// struct; there is only one of each since 64-bit inode numbers.
// NOLINTBEGIN(bugprone-reserved-identifier): libc's own names
VELKSHIM_API int __xstat(int, const char *path, struct stat *status) noexcept {
    return shim::stat_narrow(path, status);
}

VELKSHIM_API int __xstat64(int, const char *path, struct stat64 *status) noexcept {
    return shim::stat_wide(path, status);
}

VELKSHIM_API int __lxstat(int, const char *path, struct stat *status) noexcept {
    return shim::lstat_narrow(path, status);
}

VELKSHIM_API int __lxstat64(int, const char *path, struct stat64 *status) noexcept {
    return shim::lstat_wide(path, status);
}

VELKSHIM_API int __fxstatat(int, int folder, const char *path, struct stat *status,
                            int flags) noexcept {
    return shim::fstatat_narrow(folder, path, status, flags);
}

VELKSHIM_API int __fxstatat64(int, int folder, const char *path, struct stat64 *status,
                              int flags) noexcept {
    return shim::fstatat_wide(folder, path, status, flags);
}
// NOLINTEND(bugprone-reserved-identifier)

}  // extern "C"
