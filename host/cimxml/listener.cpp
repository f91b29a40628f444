#include "host/cimxml/listener.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>

#include <cerrno>
#include <charconv>
#include <cstring>

namespace velkhost::cimxml {
namespace {

// An address as the system takes it.
struct SocketAddress {
    sockaddr_storage storage{};
    socklen_t length = 0;

    [[nodiscard]] sockaddr *get() { return reinterpret_cast<sockaddr *>(&storage); }
    [[nodiscard]] in_port_t &port() {
        return storage.ss_family == AF_INET6 ? reinterpret_cast<sockaddr_in6 &>(storage).sin6_port
                                             : reinterpret_cast<sockaddr_in &>(storage).sin_port;
    }
};

bool is_ipv6(const std::string &host) {
    return host.find(':') != std::string::npos;
}

// False when the host is no number of an address.
bool fill(SocketAddress &out, const ListenAddress &address) {
    if (is_ipv6(address.host)) {
        auto &six = reinterpret_cast<sockaddr_in6 &>(out.storage);
        six.sin6_family = AF_INET6;
        six.sin6_port = htons(address.port);
        out.length = sizeof six;
        return inet_pton(AF_INET6, address.host.c_str(), &six.sin6_addr) == 1;
    }
    auto &four = reinterpret_cast<sockaddr_in &>(out.storage);
    four.sin_family = AF_INET;
    four.sin_port = htons(address.port);
    out.length = sizeof four;
    return inet_pton(AF_INET, address.host.c_str(), &four.sin_addr) == 1;
}

[[noreturn]] void fail_to_listen(const ListenAddress &address) {
    throw ListenError("cannot listen on " + address.text() + ": " + std::strerror(errno));
}

}  // namespace

ListenAddress ListenAddress::parse(std::string_view text) {
    const auto fail = [text] {
        throw ListenError("\"" + std::string(text) +
                          "\" is no address such as 127.0.0.1:5988 or [::1]:5988");
    };
    const std::size_t colon = text.rfind(':');
    ListenAddress address;
    if (colon == std::string_view::npos) {
        fail();
    }
    std::string_view host = text.substr(0, colon);
    const bool bracketed = host.starts_with('[') && host.ends_with(']');
    host = bracketed ? host.substr(1, host.size() - 2) : host;
    address.host = host == "localhost" ? "127.0.0.1" : host;
    const std::string_view port = text.substr(colon + 1);
    const char *const end = port.data() + port.size();
    const auto read = std::from_chars(port.data(), end, address.port);
    SocketAddress ignored;
    if (read.ec != std::errc() || read.ptr != end || bracketed != is_ipv6(address.host) ||
        !fill(ignored, address)) {
        fail();
    }
    return address;
}

bool ListenAddress::is_loopback() const {
    SocketAddress address;
    fill(address, *this);
    if (is_ipv6(host)) {
        return IN6_IS_ADDR_LOOPBACK(&reinterpret_cast<sockaddr_in6 &>(address.storage).sin6_addr);
    }
    const auto &four = reinterpret_cast<const sockaddr_in &>(address.storage);
    return ntohl(four.sin_addr.s_addr) >> 24U == 127;
}

std::string ListenAddress::text() const {
    const std::string shown = is_ipv6(host) ? '[' + host + ']' : host;
    return shown + ':' + std::to_string(port);
}

Descriptor listen_on(ListenAddress &address) {
    constexpr int kBacklog = 128;
    SocketAddress place;
    fill(place, address);
    Descriptor fd(socket(place.storage.ss_family, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
    const int on = 1;
    if (fd.get() < 0 || setsockopt(fd.get(), SOL_SOCKET, SO_REUSEADDR, &on, sizeof on) != 0 ||
        bind(fd.get(), place.get(), place.length) != 0 || listen(fd.get(), kBacklog) != 0 ||
        getsockname(fd.get(), place.get(), &place.length) != 0) {
        fail_to_listen(address);
    }
    address.port = ntohs(place.port());
    return fd;
}

}  // namespace velkhost::cimxml
