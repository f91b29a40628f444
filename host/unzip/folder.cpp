#include "host/unzip/folder.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <atomic>
#include <cerrno>
#include <cstdio>

#include "host/unzip/failure.h"

namespace velkhost::unzip {
namespace {

// Modes in the archive count for nothing: no file of a package is run, or changed by others.
constexpr mode_t kFolderMode = 0755;
constexpr mode_t kFileMode = 0644;

constexpr int kFolderFlags = O_PATH | O_DIRECTORY | O_CLOEXEC;

[[noreturn]] void fail_to_write() {
    throw Failure(errno == ENOMEM ? kMinizipNoMemory : kMinizipCannotWrite);
}

Descriptor checked(int descriptor) {
    if (descriptor < 0) {
        fail_to_write();
    }
    return Descriptor(descriptor);
}

void make_with_parents(const std::string &path) {
    for (std::size_t end = 0; end != std::string::npos;) {
        end = path.find('/', end + 1);
        if (mkdir(path.substr(0, end).c_str(), kFolderMode) != 0 && errno != EEXIST) {
            fail_to_write();
        }
    }
}

Descriptor open_inside(int folder, const std::string &part) {
    if (mkdirat(folder, part.c_str(), kFolderMode) != 0 && errno != EEXIST) {
        fail_to_write();
    }
    return checked(openat(folder, part.c_str(), kFolderFlags | O_NOFOLLOW));
}

std::string next_temporary_name() {
    static std::atomic<unsigned long> number{0};
    return ".unzip-" + std::to_string(getpid()) + '-' + std::to_string(++number);
}

}  // namespace

Folder Folder::at(const std::string &path) {
    const int present = open(path.c_str(), kFolderFlags);
    if (present >= 0) {
        return Folder(Descriptor(present));
    }
    make_with_parents(path);
    return Folder(checked(open(path.c_str(), kFolderFlags)));
}

Folder Folder::inside(std::span<const std::string> parts) const {
    Descriptor reached = checked(fcntl(descriptor_.get(), F_DUPFD_CLOEXEC, 0));
    for (const std::string &part : parts) {
        reached = open_inside(reached.get(), part);
    }
    return Folder(std::move(reached));
}

NewFile::NewFile(const Folder &folder) : folder_(folder.descriptor()) {
    int descriptor = -1;
    do {
        temporary_name_ = next_temporary_name();
        descriptor = openat(folder_, temporary_name_.c_str(),
                            O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, kFileMode);
    } while (descriptor < 0 && errno == EEXIST);
    descriptor_ = checked(descriptor);
}

NewFile::~NewFile() {
    if (!temporary_name_.empty()) {
        unlinkat(folder_, temporary_name_.c_str(), 0);
    }
}

void NewFile::write(std::span<const char> bytes) {
    while (!bytes.empty()) {
        const ssize_t count = ::write(descriptor_.get(), bytes.data(), bytes.size());
        if (count < 0 && errno != EINTR) {
            fail_to_write();
        }
        bytes = bytes.subspan(static_cast<std::size_t>(count < 0 ? 0 : count));
    }
}

void NewFile::complete(const std::string &name) {
    if (!descriptor_.close() ||
        renameat(folder_, temporary_name_.c_str(), folder_, name.c_str()) != 0) {
        fail_to_write();
    }
    temporary_name_.clear();
}

}  // namespace velkhost::unzip
