#include "tests/integration/transfers/loopback.h"

#include <arpa/inet.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <utility>

namespace velkhost::testing {
sockaddr_in loopback_address(std::uint16_t port) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    return address;
}

Socket::~Socket() {
    if (fd_ >= 0) {
        close(fd_);
    }
}

Socket::Socket(Socket &&other) noexcept : fd_(std::exchange(other.fd_, -1)) {}

Socket &Socket::operator=(Socket &&other) noexcept {
    std::swap(fd_, other.fd_);
    return *this;
}

Socket bound_socket(int type, std::uint16_t port) {
    Socket made(socket(AF_INET, type | SOCK_CLOEXEC, 0));
    const sockaddr_in address = loopback_address(port);
    const int failed =
        bind(made.fd(), reinterpret_cast<const sockaddr *>(&address), sizeof(address));
    return failed != 0 ? Socket() : std::move(made);
}

Socket connected_socket(int type, std::uint16_t port) {
    Socket made(socket(AF_INET, type | SOCK_CLOEXEC, 0));
    const sockaddr_in address = loopback_address(port);
    const int failed =
        connect(made.fd(), reinterpret_cast<const sockaddr *>(&address), sizeof(address));
    return failed != 0 ? Socket() : std::move(made);
}

std::uint16_t port_of(const Socket &socket) {
    sockaddr_in address{};
    socklen_t length = sizeof(address);
    getsockname(socket.fd(), reinterpret_cast<sockaddr *>(&address), &length);
    return ntohs(address.sin_port);
}

bool is_readable(const Socket &socket) {
    constexpr int kMillis = 100;
    pollfd end{socket.fd(), POLLIN, 0};
    return poll(&end, 1, kMillis) > 0;
}

}  // namespace velkhost::testing
