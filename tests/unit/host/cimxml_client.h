// A client of the loopback, for tests: bytes out, bytes in, never for longer than a while.
#pragma once

#include "host/cimxml/descriptor.h"

#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>

#include <array>
#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::cimxml::testing {

class Client {
  public:
    explicit Client(std::uint16_t port) : fd_(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_port = htons(port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        connected_ =
            connect(fd_.get(), reinterpret_cast<sockaddr *>(&address), sizeof address) == 0;
    }

    [[nodiscard]] bool connected() const { return connected_; }

    void send(std::string_view bytes) const {
        while (!bytes.empty()) {
            const ssize_t count = ::send(fd_.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL);
            if (count <= 0) {
                return;
            }
            bytes.remove_prefix(static_cast<std::size_t>(count));
        }
    }

    void end_sending() const { shutdown(fd_.get(), SHUT_WR); }

    // The next response, head and body; what came by the end of the connection or of patience.
    std::string receive() {
        while (true) {
            const std::size_t length = whole_length();
            if (length != 0) {
                std::string response = buffer_.substr(0, length);
                buffer_.erase(0, length);
                return response;
            }
            if (!read_more()) {
                return std::exchange(buffer_, {});
            }
        }
    }

    // Whether the server has closed the connection, with nothing before it.
    bool at_end() { return buffer_.empty() && !read_more() && ended_; }

  private:
    // Of the response at the front of the buffer; 0: it is not all there.
    [[nodiscard]] std::size_t whole_length() const {
        constexpr std::string_view kLength = "Content-Length: ";
        const std::size_t head = buffer_.find("\r\n\r\n");
        if (head == std::string::npos) {
            return 0;
        }
        const std::size_t field = buffer_.find(kLength);
        const std::size_t body =
            field < head ? std::stoul(buffer_.substr(field + kLength.size())) : 0;
        return buffer_.size() >= head + 4 + body ? head + 4 + body : 0;
    }

    bool read_more() {
        constexpr int kPatienceMs = 20'000;
        std::array<char, 16384> bytes{};
        pollfd readable = {fd_.get(), POLLIN, 0};
        if (poll(&readable, 1, kPatienceMs) <= 0) {
            return false;
        }
        const ssize_t count = recv(fd_.get(), bytes.data(), bytes.size(), 0);
        ended_ = count <= 0;
        buffer_.append(bytes.data(), count > 0 ? static_cast<std::size_t>(count) : 0);
        return count > 0;
    }

    Descriptor fd_;
    bool connected_ = false;
    bool ended_ = false;
    std::string buffer_;
};

}  // namespace velkhost::cimxml::testing
