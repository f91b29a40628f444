// The calls that make, change and remove names.
#include "host/shim/libc_calls.h"
#include "host/shim/on_path.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

int remove_file(const char *path) {
    return on_path("unlink", path, libc().unlink);
}

int remove_folder(const char *path) {
    return on_path("rmdir", path, libc().rmdir);
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API int unlink(const char *path) noexcept {
    return shim::remove_file(path);
}

VELKSHIM_API int rmdir(const char *path) noexcept {
    return shim::remove_folder(path);
}

// In its two steps, as libc does it, so that each can be made to fail.
VELKSHIM_API int remove(const char *path) noexcept {
    const int result = shim::remove_file(path);
    return result != 0 && errno == EISDIR ? shim::remove_folder(path) : result;
}

VELKSHIM_API int unlinkat(int folder, const char *path, int flags) noexcept {
    const char *const verb = (flags & AT_REMOVEDIR) != 0 ? "rmdir" : "unlink";
    return shim::on_path(
        verb, path, [=](const char *real) { return shim::libc().unlinkat(folder, real, flags); });
}

VELKSHIM_API int mkdir(const char *path, mode_t mode) noexcept {
    return shim::on_path("mkdir", path,
                         [mode](const char *real) { return shim::libc().mkdir(real, mode); });
}

VELKSHIM_API int mkdirat(int folder, const char *path, mode_t mode) noexcept {
    return shim::on_path(
        "mkdir", path, [=](const char *real) { return shim::libc().mkdirat(folder, real, mode); });
}

VELKSHIM_API int rename(const char *from, const char *to) noexcept {
    return shim::on_paths("rename", from, to, shim::libc().rename);
}

VELKSHIM_API int renameat(int from_folder, const char *from, int to_folder,
                          const char *to) noexcept {
    return shim::on_paths("rename", from, to, [=](const char *real_from, const char *real_to) {
        return shim::libc().renameat(from_folder, real_from, to_folder, real_to);
    });
}

VELKSHIM_API int link(const char *from, const char *to) noexcept {
    return shim::on_paths("link", from, to, shim::libc().link);
}

// What the link says is text and stays as it is; where it stands is re-rooted.
VELKSHIM_API int symlink(const char *target, const char *path) noexcept {
    return shim::on_path("symlink", path,
                         [target](const char *real) { return shim::libc().symlink(target, real); });
}

VELKSHIM_API int chmod(const char *path, mode_t mode) noexcept {
    return shim::on_path("chmod", path,
                         [mode](const char *real) { return shim::libc().chmod(real, mode); });
}

VELKSHIM_API int truncate(const char *path, off_t length) noexcept {
    return shim::on_path("truncate", path, [length](const char *real) {
        return shim::libc().truncate(real, length);
    });
}

VELKSHIM_API int truncate64(const char *path, off64_t length) noexcept {
    return shim::on_path("truncate", path, [length](const char *real) {
        return shim::libc().truncate64(real, length);
    });
}

}  // extern "C"
