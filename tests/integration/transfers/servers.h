// Real servers of packages, on free ports of the loopback interface.
#pragma once

#include "tests/integration/transfers/daemon.h"

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>

namespace velkhost::testing {

// atftpd, serving a folder.
class TftpServer {
  public:
    // `place` is for the server's own files; it and `folder` can be read by everybody.
    TftpServer(const std::filesystem::path &folder, const std::filesystem::path &place);

    [[nodiscard]] std::uint16_t port() const { return port_; }
    void kill() { daemon_->kill(); }

  private:
    std::uint16_t port_;
    std::unique_ptr<Daemon> daemon_;
};

// OpenSSH's server with keys of its own and one user, who has a key and a password. Users and
// passwords come from files of the test (nss_wrapper), so that it needs no account of the machine.
class SftpServer {
  public:
    static constexpr const char *kUser = "velk";
    static constexpr const char *kPassword = "correct horse";

    // As above; locations name files by their paths.
    explicit SftpServer(const std::filesystem::path &place);

    [[nodiscard]] std::uint16_t port() const { return port_; }
    [[nodiscard]] std::filesystem::path user_key() const { return place_ / "user"; }
    // The server's host key, as known at that port.
    [[nodiscard]] std::filesystem::path known_hosts(std::uint16_t port) const;
    // Another host key in its place.
    [[nodiscard]] std::filesystem::path wrong_known_hosts() const;
    void kill() { daemon_->kill(); }

  private:
    void make_key(const std::string &name) const;
    [[nodiscard]] std::string public_key(const std::string &name) const;
    void write(const std::string &name, const std::string &text) const;
    void write_accounts() const;
    void start();

    std::filesystem::path place_;
    std::uint16_t port_;
    std::unique_ptr<Daemon> daemon_;
};

}  // namespace velkhost::testing
