#include "tests/support/file_calls.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdarg>

namespace velktest {
namespace {

thread_local FileCalls *recorder = nullptr;

void note(const char *verb, std::string_view subject = {}) {
    if (recorder != nullptr) {
        recorder->note(verb + std::string(subject));
    }
}

}  // namespace

FileCalls::FileCalls() {
    recorder = this;
}

FileCalls::~FileCalls() {
    recorder = nullptr;
}

}  // namespace velktest

// The linker sends the calls here and the __real_ ones on (--wrap). Visible, because sanitizers'
// libraries refer to the same names.
// NOLINTBEGIN(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" {

int __real_open(const char *path, int flags, ...);
int __real_open64(const char *path, int flags, ...);
ssize_t __real_write(int fd, const void *text, size_t size);
int __real_close(int fd);

[[gnu::visibility("default")]] int __wrap_open(const char *path, int flags, mode_t mode) {
    velktest::note("open ", path);
    return __real_open(path, flags, mode);
}

[[gnu::visibility("default")]] int __wrap_open64(const char *path, int flags, mode_t mode) {
    velktest::note("open ", path);
    return __real_open64(path, flags, mode);
}

[[gnu::visibility("default")]] ssize_t __wrap_write(int fd, const void *text, size_t size) {
    velktest::note("write ", {static_cast<const char *>(text), size});
    return __real_write(fd, text, size);
}

[[gnu::visibility("default")]] int __wrap_close(int fd) {
    velktest::note("close");
    return __real_close(fd);
}
}
// NOLINTEND(bugprone-reserved-identifier,readability-identifier-naming)
