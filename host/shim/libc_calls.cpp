#include "host/shim/libc_calls.h"

#include <atomic>
#include <cstdlib>
#include <mutex>
#include <string_view>

#include "host/shim/complain.h"
#include "host/shim/futex.h"

namespace velkhost::shim {
namespace {

constinit LibcCalls table{};
constinit std::atomic<bool> table_is_filled{false};
constinit FutexMutex filling;

// The definition that the caller would have got without the shim: a sanitizer's, or libc's.
template <typename Function>
void find(Function &slot, const char *name) {
    slot = reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
    if (slot == nullptr) {
        complain({"libc has no function ", name});
        std::abort();
    }
}

void find_files() {
    find(table.open, "open");
    find(table.open64, "open64");
    find(table.openat, "openat");
    find(table.openat64, "openat64");
    find(table.close, "close");
    find(table.fopen, "fopen");
    find(table.fopen64, "fopen64");
    find(table.freopen, "freopen");
    find(table.freopen64, "freopen64");
    find(table.fclose, "fclose");
    find(table.opendir, "opendir");
    find(table.closedir, "closedir");
}

void find_names() {
    find(table.unlink, "unlink");
    find(table.unlinkat, "unlinkat");
    find(table.rmdir, "rmdir");
    find(table.mkdir, "mkdir");
    find(table.mkdirat, "mkdirat");
    find(table.rename, "rename");
    find(table.renameat, "renameat");
    find(table.symlink, "symlink");
    find(table.link, "link");
    find(table.chmod, "chmod");
    find(table.truncate, "truncate");
    find(table.truncate64, "truncate64");
}

void find_inspections() {
    find(table.access, "access");
    find(table.faccessat, "faccessat");
    find(table.readlink, "readlink");
    find(table.readlinkat, "readlinkat");
    find(table.stat, "stat");
    find(table.stat64, "stat64");
    find(table.lstat, "lstat");
    find(table.lstat64, "lstat64");
    find(table.fstatat, "fstatat");
    find(table.fstatat64, "fstatat64");
    find(table.statx, "statx");
}

void find_devices() {
    find(table.ioctl, "ioctl");
    find(table.poll, "poll");
    find(table.poll_chk, "__poll_chk");
    find(table.dup, "dup");
    find(table.dup2, "dup2");
    find(table.dup3, "dup3");
    find(table.fcntl, "fcntl");
    find(table.fcntl64, "fcntl64");
}

void find_clock_and_threads() {
    find(table.sleep, "sleep");
    find(table.usleep, "usleep");
    find(table.nanosleep, "nanosleep");
    find(table.clock_nanosleep, "clock_nanosleep");
    find(table.time, "time");
    find(table.gettimeofday, "gettimeofday");
    find(table.clock_gettime, "clock_gettime");
    find(table.pthread_create, "pthread_create");
    find(table.pthread_join, "pthread_join");
}

void fill() {
    const std::lock_guard lock(filling);
    if (table_is_filled.load(std::memory_order_relaxed)) {
        return;
    }
    find_files();
    find_names();
    find_inspections();
    find_devices();
    find_clock_and_threads();
    find(table.dlopen, "dlopen");
    find(table.uname, "uname");
    find(table.gethostname, "gethostname");
    table_is_filled.store(true, std::memory_order_release);
}

}  // namespace

const LibcCalls &libc() {
    if (!table_is_filled.load(std::memory_order_acquire)) [[unlikely]] {
        fill();
    }
    return table;
}

}  // namespace velkhost::shim
