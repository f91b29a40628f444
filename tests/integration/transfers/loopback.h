// Sockets on the loopback interface.
#pragma once

#include <netinet/in.h>

#include <cstdint>

namespace velkhost::testing {

// Owns a descriptor; -1 where a socket could not be had.
class Socket {
  public:
    explicit Socket(int fd = -1) : fd_(fd) {}
    ~Socket();
    Socket(Socket &&other) noexcept;
    Socket &operator=(Socket &&other) noexcept;
    Socket(const Socket &) = delete;
    Socket &operator=(const Socket &) = delete;

    [[nodiscard]] int fd() const { return fd_; }

  private:
    int fd_;
};

sockaddr_in loopback_address(std::uint16_t port);

// `type` is SOCK_STREAM or SOCK_DGRAM; port 0 takes a free one.
Socket bound_socket(int type, std::uint16_t port);
Socket connected_socket(int type, std::uint16_t port);
std::uint16_t port_of(const Socket &socket);

// Whether something can be read within a tenth of a second.
bool is_readable(const Socket &socket);

}  // namespace velkhost::testing
