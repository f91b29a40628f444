// Files without stdio: a descriptor that closes itself and a line reader that allocates nothing.
#pragma once

#include <fcntl.h>
#include <unistd.h>

#include <cstddef>
#include <span>
#include <string_view>

namespace velk {

class FileDescriptor {
  public:
    FileDescriptor(const char *path, int flags, mode_t mode = 0666)
        : fd_(::open(path, flags | O_CLOEXEC, mode)) {}
    ~FileDescriptor() { close(); }
    FileDescriptor(const FileDescriptor &) = delete;
    FileDescriptor &operator=(const FileDescriptor &) = delete;

    [[nodiscard]] bool is_open() const { return fd_ >= 0; }
    [[nodiscard]] int get() const { return fd_; }

    // One write call; a text that the file system takes only in part stays in part.
    void write(std::string_view text) const {
        if (is_open()) {
            [[maybe_unused]] const ssize_t written = ::write(fd_, text.data(), text.size());
        }
    }

    // 0, or -1 when it was not open or could not be closed.
    int close() {
        if (!is_open()) {
            return -1;
        }
        const int result = ::close(fd_);
        fd_ = -1;
        return result;
    }

    // Gives the descriptor up without closing it.
    int release() {
        const int fd = fd_;
        fd_ = -1;
        return fd;
    }

  private:
    int fd_;
};

// Rewrites the file whole; false when it cannot be opened.
inline bool rewrite_file(const char *path, std::string_view text) {
    const FileDescriptor file(path, O_WRONLY | O_CREAT | O_TRUNC);
    file.write(text);
    return file.is_open();
}

// Reads a text file by lines. A line that does not fit the caller's buffer goes on in the next one.
class LineReader {
  public:
    explicit LineReader(const char *path) : file_(path, O_RDONLY) {}

    [[nodiscard]] bool is_open() const { return file_.is_open(); }

    // Reads up to the line end, which is kept, or as far as `line` holds with a terminator.
    // Returns false, and leaves `line` as it is, at the end of the file or on a read error.
    bool next(std::span<char> line);

  private:
    bool fill();

    FileDescriptor file_;
    char block_[4096];
    std::size_t begin_ = 0;
    std::size_t end_ = 0;
};

}  // namespace velk
