#include "bench/http_client.h"

#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

#include <array>
#include <cstring>
#include <memory>
#include <stdexcept>

namespace velkbench {
namespace {

// "12" of "Content-Length: 12" for the name in lower case; empty for another field.
std::string value_of(const std::string &line, std::string_view name) {
    const bool same =
        line.size() > name.size() && strncasecmp(line.data(), name.data(), name.size()) == 0;
    const std::size_t start = same ? line.find_first_not_of(' ', name.size()) : std::string::npos;
    return start == std::string::npos ? std::string() : line.substr(start);
}

}  // namespace

Response HttpClient::ask(std::string_view request) {
    if (fd_.get() < 0) {
        connect();
    }
    send(request);
    Response response;
    const std::string status = take_line();
    response.status = status.size() > 12 ? std::stoi(status.substr(9, 3)) : 0;
    std::size_t length = 0;
    bool chunked = false;
    bool last = false;
    for (std::string line = take_line(); !line.empty(); line = take_line()) {
        const std::string digits = value_of(line, "content-length:");
        length = digits.empty() ? length : std::stoul(digits);
        chunked = chunked || value_of(line, "transfer-encoding:") == "chunked";
        last = last || value_of(line, "connection:") == "close";
    }
    response.body = chunked ? take_chunks() : take_bytes(length);
    if (last) {
        disconnect();
    }
    return response;
}

void HttpClient::connect() {
    addrinfo hints{};
    hints.ai_socktype = SOCK_STREAM;
    addrinfo *found = nullptr;
    if (const int error = getaddrinfo(url_.host.c_str(), url_.port.c_str(), &hints, &found);
        error != 0) {
        throw std::runtime_error(url_.host + ": " + gai_strerror(error));
    }
    const std::unique_ptr<addrinfo, decltype(&freeaddrinfo)> addresses(found, &freeaddrinfo);
    for (const addrinfo *each = found; each != nullptr; each = each->ai_next) {
        fd_.reset(socket(each->ai_family, SOCK_STREAM | SOCK_CLOEXEC, 0));
        if (::connect(fd_.get(), each->ai_addr, each->ai_addrlen) == 0) {
            const int on = 1;
            setsockopt(fd_.get(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
            buffer_.clear();
            return;
        }
    }
    fd_.reset();
    throw std::runtime_error("cannot connect to " + url_.host + ':' + url_.port);
}

void HttpClient::send(std::string_view bytes) const {
    while (!bytes.empty()) {
        const ssize_t count = ::send(fd_.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (count <= 0) {
            throw std::runtime_error("the server has closed the connection");
        }
        bytes.remove_prefix(static_cast<std::size_t>(count));
    }
}

void HttpClient::read_more() {
    std::array<char, 65536> bytes;
    const ssize_t count = recv(fd_.get(), bytes.data(), bytes.size(), 0);
    if (count <= 0) {
        throw std::runtime_error("the server has closed the connection");
    }
    buffer_.append(bytes.data(), static_cast<std::size_t>(count));
}

std::string HttpClient::take_line() {
    std::size_t end = buffer_.find("\r\n");
    while (end == std::string::npos) {
        read_more();
        end = buffer_.find("\r\n");
    }
    std::string line = buffer_.substr(0, end);
    buffer_.erase(0, end + 2);
    return line;
}

std::string HttpClient::take_bytes(std::size_t count) {
    while (buffer_.size() < count) {
        read_more();
    }
    std::string bytes = buffer_.substr(0, count);
    buffer_.erase(0, count);
    return bytes;
}

std::string HttpClient::take_chunks() {
    std::string body;
    while (const std::size_t size = std::stoul(take_line(), nullptr, 16)) {
        body += take_bytes(size);
        take_line();
    }
    while (!take_line().empty()) {  // trailers
    }
    return body;
}

}  // namespace velkbench
