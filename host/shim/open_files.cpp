#include "host/shim/open_files.h"

#include <fcntl.h>

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <new>

#include "host/shim/faults.h"
#include "host/shim/hook.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {

struct OpenFile {
    OpenedFor purpose = OpenedFor::kWriting;
    char *fixed_path = nullptr;

    OpenFile(OpenedFor opened_for, std::string_view path)
        : purpose(opened_for), fixed_path(strndup(path.data(), path.size())) {}
    OpenFile(const OpenFile &) = delete;
    OpenFile &operator=(const OpenFile &) = delete;
    ~OpenFile() { std::free(fixed_path); }
};

namespace {

// By descriptor number. Higher numbers go unobserved; the kernel hands out the lowest free one.
constinit std::array<std::atomic<OpenFile *>, 65536> open_files{};

constinit Hook<void(void *, const char *, int64_t)> file_observer;

OpenFile *exchange(int descriptor, OpenFile *file) {
    if (descriptor < 0 || static_cast<std::size_t>(descriptor) >= open_files.size()) {
        delete file;
        return nullptr;
    }
    auto &slot = open_files[static_cast<std::size_t>(descriptor)];
    if (file == nullptr && slot.load(std::memory_order_relaxed) == nullptr) {
        return nullptr;  // the usual case costs no locked instruction
    }
    return slot.exchange(file, std::memory_order_acq_rel);
}

}  // namespace

OpenedFor purpose_of(int open_flags) {
    return (open_flags & O_ACCMODE) == O_RDONLY ? OpenedFor::kReading : OpenedFor::kWriting;
}

OpenedFor purpose_of(const char *stdio_mode) {
    return std::strpbrk(stdio_mode, "wa+") == nullptr ? OpenedFor::kReading : OpenedFor::kWriting;
}

void remember_open(int descriptor, const Rerooted &target, OpenedFor purpose) {
    if (descriptor < 0) {
        return;
    }
    OpenFile *file = nullptr;
    if (!target.fixed().empty() && purpose != OpenedFor::kReading) {
        file = new (std::nothrow) OpenFile(purpose, target.fixed());
    }
    delete exchange(descriptor, file);
}

Closing::Closing(int descriptor) : file_(exchange(descriptor, nullptr)) {}

int Closing::fault(std::string_view verb) const {
    return file_ == nullptr || file_->fixed_path == nullptr ? 0 : fault_at(verb, file_->fixed_path);
}

Closing::~Closing() {
    if (file_ == nullptr) {
        return;
    }
    const int saved = errno;
    if (file_->purpose == OpenedFor::kWriting && file_->fixed_path != nullptr) {
        file_observer(file_->fixed_path, velkshim_now_us());
    }
    delete file_;
    errno = saved;
}

}  // namespace velkhost::shim

void velkshim_observe_files(velkshim_file_observer observer, void *context) {
    velkhost::shim::file_observer.set(observer, context);
}
