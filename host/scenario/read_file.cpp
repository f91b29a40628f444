#include "host/scenario/read_file.h"

#include <array>
#include <cerrno>

#include <fcntl.h>
#include <unistd.h>

namespace velkhost::scenario {
namespace {

class Descriptor {
  public:
    explicit Descriptor(const std::string &path)
        : fd_(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {}
    ~Descriptor() {
        if (fd_ >= 0) {
            const int kept = errno;
            ::close(fd_);
            errno = kept;
        }
    }
    Descriptor(const Descriptor &) = delete;
    Descriptor &operator=(const Descriptor &) = delete;

    [[nodiscard]] int get() const { return fd_; }

  private:
    int fd_;
};

}  // namespace

std::optional<std::string> read_file(const std::string &path) {
    const Descriptor file(path);
    if (file.get() < 0) {
        return std::nullopt;
    }
    std::string text;
    std::array<char, 4096> block{};
    for (;;) {
        const ssize_t got = ::read(file.get(), block.data(), block.size());
        if (got == 0) {
            return text;
        }
        if (got < 0 && errno != EINTR) {
            return std::nullopt;
        }
        text.append(block.data(), got < 0 ? 0 : static_cast<std::size_t>(got));
    }
}

}  // namespace velkhost::scenario
