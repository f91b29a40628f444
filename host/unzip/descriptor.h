// A file descriptor that is closed with its owner.
#pragma once

#include <unistd.h>

#include <utility>

namespace velkhost::unzip {

class Descriptor {
  public:
    explicit Descriptor(int value) : value_(value) {}
    ~Descriptor() { close(); }
    Descriptor(Descriptor &&other) noexcept : value_(other.release()) {}
    Descriptor &operator=(Descriptor &&other) noexcept {
        std::swap(value_, other.value_);
        return *this;
    }
    Descriptor(const Descriptor &) = delete;
    Descriptor &operator=(const Descriptor &) = delete;

    [[nodiscard]] bool is_open() const { return value_ >= 0; }
    [[nodiscard]] int get() const { return value_; }
    int release() { return std::exchange(value_, -1); }

    // Whether nothing was lost: some file systems report only here that they are full.
    bool close() { return value_ < 0 || ::close(release()) == 0; }

  private:
    int value_;
};

}  // namespace velkhost::unzip
