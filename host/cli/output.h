// Where the command writes. A reader that has gone is no reason to stop the run.
#pragma once

#include <string_view>

namespace velkhost::cli {

class Output {
  public:
    explicit Output(int fd) : fd_(fd) {}

    // The whole text, in as few writes as the system needs. After the first failure nothing more
    // is written.
    void write(std::string_view text);

    [[nodiscard]] int fd() const { return fd_; }
    [[nodiscard]] bool is_broken() const { return broken_; }

  private:
    int fd_;
    bool broken_ = false;
};

}  // namespace velkhost::cli
