// A bad line between a client and a server on the loopback interface: it lets so many bytes of the
// server's pass and then turns bad. One conversation at a time, as the client has them.
#pragma once

#include "tests/integration/transfers/loopback.h"

#include <cstdint>
#include <functional>
#include <stop_token>
#include <thread>

namespace velkhost::testing {

struct BadLine {
    std::uint64_t good_bytes = 0;  // of the server's, in all conversations together
    // What happens then, once; afterwards nothing passes in either direction.
    std::function<void()> then = [] {};
    bool hangs_up = false;  // TCP: the connection is closed as well
};

class Relay {
  public:
    // `type` is SOCK_STREAM, or SOCK_DGRAM for TFTP, whose server answers from another port.
    Relay(int type, std::uint16_t server_port, BadLine line);
    ~Relay();
    Relay(const Relay &) = delete;
    Relay &operator=(const Relay &) = delete;

    [[nodiscard]] std::uint16_t port() const { return port_of(entry_); }

  private:
    void run_tcp(const std::stop_token &stop);
    void run_udp(const std::stop_token &stop);
    void converse(const Socket &client, const Socket &server, const std::stop_token &stop);
    bool lets_pass(std::uint64_t bytes);

    const int type_;
    const std::uint16_t server_port_;
    BadLine line_;
    bool is_bad_ = false;
    std::uint64_t passed_ = 0;
    Socket entry_;
    std::jthread thread_;  // last: it uses all of the above
};

}  // namespace velkhost::testing
