// A server's process, which ends with its object, and also when the test itself is killed.
#pragma once

#include <sys/types.h>

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace velkhost::testing {

class Daemon {
  public:
    // Runs the command in a process group of its own, with its output in `log`. Where the test runs
    // as root the server runs as `kServerUser`: it needs no rights but to read what it serves.
    Daemon(const std::vector<std::string> &command, const std::filesystem::path &log,
           const std::map<std::string, std::string> &environment = {});
    ~Daemon();
    Daemon(const Daemon &) = delete;
    Daemon &operator=(const Daemon &) = delete;

    // Ends it now, with all that it has started.
    void kill();

    // The user and the group that the server runs as.
    static uid_t user();
    static gid_t group();

  private:
    pid_t process_ = -1;
};

// A port of the loopback interface that nobody listens at.
std::uint16_t free_tcp_port();
std::uint16_t free_udp_port();

// Waits until somebody does; throws std::runtime_error with the log when nobody comes.
void wait_for_tcp(std::uint16_t port, const std::filesystem::path &log);
void wait_for_udp(std::uint16_t port, const std::filesystem::path &log);

}  // namespace velkhost::testing
