// Addresses to listen on.
#pragma once

#include "host/cimxml/descriptor.h"

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

namespace velkhost::cimxml {

// An address that is none, or that cannot be listened on; what() says which and why.
class ListenError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

// Numbers, not names: "127.0.0.1", "::1".
struct ListenAddress {
    std::string host;
    std::uint16_t port = 0;  // 0: one that is free

    // "127.0.0.1:5988", "[::1]:0", "localhost:5988". Throws ListenError.
    static ListenAddress parse(std::string_view text);

    // Whether only this machine can reach it.
    [[nodiscard]] bool is_loopback() const;

    // As parse takes it.
    [[nodiscard]] std::string text() const;
};

// A socket that listens and does not block; the port that was chosen is put into the address.
// Throws ListenError.
Descriptor listen_on(ListenAddress &address);

}  // namespace velkhost::cimxml
