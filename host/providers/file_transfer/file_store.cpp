#include "host/providers/file_transfer/file_store.h"

#include <algorithm>
#include <cerrno>
#include <limits>
#include <memory>
#include <system_error>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

namespace velkhost::providers {
namespace {

constexpr int kMostNames = 1000;

struct CloseFolder {
    void operator()(DIR *folder) const { ::closedir(folder); }
};

// The size of all files of the folder; 0 for one that cannot be read.
std::uint64_t used_in(const std::string &path) {
    const std::unique_ptr<DIR, CloseFolder> folder(::opendir(path.c_str()));
    std::uint64_t used = 0;
    while (folder) {
        const dirent *entry = ::readdir(folder.get());
        if (entry == nullptr) {
            break;
        }
        struct stat about {};
        const int fd = ::dirfd(folder.get());
        if (::fstatat(fd, entry->d_name, &about, AT_SYMLINK_NOFOLLOW) == 0 &&
            S_ISREG(about.st_mode)) {
            used += static_cast<std::uint64_t>(about.st_size);
        }
    }
    return used;
}

std::uint64_t free_on_disk(int fd) {
    struct statvfs about {};
    if (::fstatvfs(fd, &about) != 0) {
        return std::numeric_limits<std::uint64_t>::max();  // a write will tell
    }
    return static_cast<std::uint64_t>(about.f_bavail) * about.f_frsize;
}

int create_exclusively(const std::string &path) {
    constexpr mode_t kOwnersAlone = 0600;
    return ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, kOwnersAlone);
}

[[noreturn]] void fail(const std::string &path) {
    throw std::system_error(errno, std::generic_category(), path);
}

}  // namespace

StoredFile::StoredFile(std::string folder, std::string path, int fd,
                       std::optional<std::uint64_t> capacity)
    : folder_(std::move(folder)), path_(std::move(path)), fd_(fd), capacity_(capacity) {}

StoredFile::StoredFile(StoredFile &&other) noexcept
    : folder_(std::move(other.folder_)),
      path_(std::move(other.path_)),
      fd_(std::exchange(other.fd_, -1)),
      capacity_(other.capacity_),
      filled_up_(other.filled_up_),
      kept_(std::exchange(other.kept_, true)) {}

StoredFile::~StoredFile() {
    if (fd_ >= 0) {
        ::close(fd_);
    }
    if (!kept_) {
        ::unlink(path_.c_str());
    }
}

std::uint64_t StoredFile::room() const {
    if (filled_up_) {
        return 0;
    }
    const std::uint64_t on_disk = free_on_disk(fd_);
    if (!capacity_) {
        return on_disk;
    }
    return std::min(on_disk, *capacity_ - std::min(*capacity_, used_in(folder_)));
}

int StoredFile::append(std::span<const char> bytes) {
    if (bytes.size() > room()) {
        return ENOSPC;
    }
    while (!bytes.empty()) {
        const ssize_t written = ::write(fd_, bytes.data(), bytes.size());
        if (written < 0 && errno != EINTR) {
            return errno;
        }
        bytes = bytes.subspan(written < 0 ? 0 : static_cast<std::size_t>(written));
    }
    return 0;
}

int StoredFile::keep() {
    if (::close(std::exchange(fd_, -1)) != 0) {
        return errno;
    }
    kept_ = true;
    return 0;
}

FileStore::FileStore(std::string folder, std::optional<std::uint64_t> capacity)
    : folder_(std::move(folder)), capacity_(capacity) {}

StoredFile FileStore::create(const std::string &name) const {
    constexpr mode_t kOwnersFolder = 0755;
    if (::mkdir(folder_.c_str(), kOwnersFolder) != 0 && errno != EEXIST) {
        fail(folder_);
    }
    for (int number = 1; number <= kMostNames; ++number) {
        std::string path = folder_ + '/';
        path += number == 1 ? name : std::to_string(number) + '-' + name;
        const int fd = create_exclusively(path);
        if (fd >= 0) {
            return {folder_, std::move(path), fd, capacity_};
        }
        if (errno != EEXIST) {
            fail(path);
        }
    }
    fail(folder_ + '/' + name);
}

}  // namespace velkhost::providers
