// The command and the host that it plays share a process, and what its libraries print to stdout
// must not get between the command's own lines.
#pragma once

#include <filesystem>

namespace velkhost::cli {

// Where such a host's init system puts what its broker and the providers print.
inline constexpr const char *kBrokerOutput = "/var/log/broker-stdout.txt";

// The process's stdout as it was, for the command alone.
class OwnStdout {
  public:
    OwnStdout();
    ~OwnStdout();
    OwnStdout(const OwnStdout &) = delete;
    OwnStdout &operator=(const OwnStdout &) = delete;

    // -1 where stdout was closed.
    [[nodiscard]] int fd() const { return fd_; }

  private:
    const int fd_;
};

// While it lives, what anyone prints to stdout goes to the end of a file.
class StdoutCapture {
  public:
    // Makes the file, and its folder where that is missing. Throws std::system_error.
    explicit StdoutCapture(const std::filesystem::path &file);
    ~StdoutCapture();
    StdoutCapture(const StdoutCapture &) = delete;
    StdoutCapture &operator=(const StdoutCapture &) = delete;

  private:
    OwnStdout before_;
};

}  // namespace velkhost::cli
