#include "tests/integration/transfers/relay.h"

#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>

#include <array>
#include <cerrno>
#include <utility>

namespace velkhost::testing {
namespace {

using Buffer = std::array<char, 65536>;

// What a socket has now, up to a buffer full; 0 when the other side has gone.
std::size_t take(const Socket &from, Buffer &buffer) {
    const ssize_t got = recv(from.fd(), buffer.data(), buffer.size(), MSG_DONTWAIT);
    return got < 0 ? 0 : static_cast<std::size_t>(got);
}

bool give(const Socket &to, const Buffer &buffer, std::size_t length) {
    return send(to.fd(), buffer.data(), length, MSG_NOSIGNAL) == static_cast<ssize_t>(length);
}

bool has_bytes(const Socket &socket) {
    char byte = 0;
    return recv(socket.fd(), &byte, 1, MSG_PEEK | MSG_DONTWAIT) >= 0 || errno != EAGAIN;
}

// Until one of them can be read, or a little time has passed.
void wait_for_either(const Socket &one, const Socket &other) {
    constexpr int kMillis = 50;
    std::array<pollfd, 2> ends = {{{one.fd(), POLLIN, 0}, {other.fd(), POLLIN, 0}}};
    poll(ends.data(), ends.size(), kMillis);
}

// The client's and the server's side of TFTP, with what passes between them.
class Datagrams {
  public:
    Datagrams(const Socket &entry, std::uint16_t server_port)
        : entry_(entry), server_port_(server_port) {}

    void wait() const { wait_for_either(entry_, upstream_); }

    void from_client(bool passes) {
        const std::size_t length = receive(entry_, client_);
        constexpr char kReadRequest = 1;  // begins a conversation (RFC 1350)
        if (length > 1 && buffer_[1] == kReadRequest) {
            upstream_ = bound_socket(SOCK_DGRAM, 0);
            server_ = loopback_address(server_port_);
        }
        if (length > 0 && passes) {
            send_on(upstream_, server_, length);
        }
    }

    // `lets_pass` is asked about each length.
    template <typename Judge>
    void from_server(Judge lets_pass) {
        const std::size_t length = receive(upstream_, server_);
        if (length > 0 && lets_pass(length)) {
            send_on(entry_, client_, length);
        }
    }

  private:
    std::size_t receive(const Socket &from, sockaddr_in &sender) {
        socklen_t size = sizeof(sender);
        const ssize_t got = recvfrom(from.fd(), buffer_.data(), buffer_.size(), MSG_DONTWAIT,
                                     reinterpret_cast<sockaddr *>(&sender), &size);
        return got < 0 ? 0 : static_cast<std::size_t>(got);
    }
    void send_on(const Socket &from, const sockaddr_in &receiver, std::size_t length) const {
        sendto(from.fd(), buffer_.data(), length, 0, reinterpret_cast<const sockaddr *>(&receiver),
               sizeof(receiver));
    }

    const Socket &entry_;
    const std::uint16_t server_port_;
    Socket upstream_;
    sockaddr_in client_{};
    sockaddr_in server_{};
    Buffer buffer_{};
};

}  // namespace

Relay::Relay(int type, std::uint16_t server_port, BadLine line)
    : type_(type),
      server_port_(server_port),
      line_(std::move(line)),
      entry_(bound_socket(type, 0)) {
    if (type_ == SOCK_STREAM) {
        listen(entry_.fd(), 4);
    }
    thread_ = std::jthread([this](const std::stop_token &stop) {
        type_ == SOCK_STREAM ? run_tcp(stop) : run_udp(stop);
    });
}

Relay::~Relay() = default;

bool Relay::lets_pass(std::uint64_t bytes) {
    if (!is_bad_ && passed_ + bytes > line_.good_bytes) {
        is_bad_ = true;
        line_.then();
    }
    passed_ += bytes;
    return !is_bad_;
}

void Relay::run_tcp(const std::stop_token &stop) {
    while (!stop.stop_requested()) {
        if (is_readable(entry_)) {
            const Socket client(accept4(entry_.fd(), nullptr, nullptr, SOCK_CLOEXEC));
            const Socket server = connected_socket(SOCK_STREAM, server_port_);
            converse(client, server, stop);
        }
    }
}

void Relay::converse(const Socket &client, const Socket &server, const std::stop_token &stop) {
    Buffer buffer{};
    bool open = server.fd() >= 0;
    while (open && !is_bad_ && !stop.stop_requested()) {
        wait_for_either(client, server);
        if (has_bytes(client)) {
            const std::size_t length = take(client, buffer);
            open = length > 0 && give(server, buffer, length);
        }
        if (open && has_bytes(server)) {
            const std::size_t length = take(server, buffer);
            open = length > 0 && (!lets_pass(length) || give(client, buffer, length));
        }
    }
    while (is_bad_ && !line_.hangs_up && !stop.stop_requested()) {
        wait_for_either(Socket(), Socket());
    }
}

void Relay::run_udp(const std::stop_token &stop) {
    Datagrams datagrams(entry_, server_port_);
    while (!stop.stop_requested()) {
        datagrams.wait();
        datagrams.from_client(!is_bad_);
        datagrams.from_server([this](std::size_t length) { return lets_pass(length); });
    }
}

}  // namespace velkhost::testing
