// The libc functions behind the shim's own definitions of the same names.
#pragma once

#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <poll.h>
#include <pthread.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/time.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <cstdio>
#include <ctime>

namespace velkhost::shim {

struct LibcCalls {
    decltype(&::open) open;
    decltype(&::open64) open64;
    decltype(&::openat) openat;
    decltype(&::openat64) openat64;
    decltype(&::close) close;
    decltype(&::fopen) fopen;
    decltype(&::fopen64) fopen64;
    decltype(&::freopen) freopen;
    decltype(&::freopen64) freopen64;
    decltype(&::fclose) fclose;
    decltype(&::opendir) opendir;
    decltype(&::closedir) closedir;

    decltype(&::unlink) unlink;
    decltype(&::unlinkat) unlinkat;
    decltype(&::rmdir) rmdir;
    decltype(&::mkdir) mkdir;
    decltype(&::mkdirat) mkdirat;
    decltype(&::rename) rename;
    decltype(&::renameat) renameat;
    decltype(&::symlink) symlink;
    decltype(&::link) link;
    decltype(&::chmod) chmod;
    decltype(&::truncate) truncate;
    decltype(&::truncate64) truncate64;

    decltype(&::access) access;
    decltype(&::faccessat) faccessat;
    decltype(&::readlink) readlink;
    decltype(&::readlinkat) readlinkat;
    decltype(&::stat) stat;
    decltype(&::stat64) stat64;
    decltype(&::lstat) lstat;
    decltype(&::lstat64) lstat64;
    decltype(&::fstatat) fstatat;
    decltype(&::fstatat64) fstatat64;
    decltype(&::statx) statx;

    decltype(&::ioctl) ioctl;
    decltype(&::poll) poll;
    int (*poll_chk)(pollfd *, nfds_t, int, size_t);
    decltype(&::dup) dup;
    decltype(&::dup2) dup2;
    decltype(&::dup3) dup3;
    decltype(&::fcntl) fcntl;
    decltype(&::fcntl64) fcntl64;

    decltype(&::dlopen) dlopen;

    decltype(&::sleep) sleep;
    decltype(&::usleep) usleep;
    decltype(&::nanosleep) nanosleep;
    decltype(&::clock_nanosleep) clock_nanosleep;
    decltype(&::time) time;
    decltype(&::gettimeofday) gettimeofday;
    decltype(&::clock_gettime) clock_gettime;

    decltype(&::pthread_create) pthread_create;
    decltype(&::pthread_join) pthread_join;

    decltype(&::uname) uname;
    decltype(&::gethostname) gethostname;
};

// Looked up when first needed, which may be before any constructor has run. Ends the process with
// one line on stderr where the machine's libc lacks one of them.
const LibcCalls &libc();

}  // namespace velkhost::shim
