#include "host/bmc/qemu_server.h"

#include "host/bmc/qemu_link.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <limits>
#include <string>
#include <system_error>
#include <utility>

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace velkhost::bmc {
namespace {

[[noreturn]] void fail(int error, const std::filesystem::path &socket) {
    throw std::system_error(error, std::generic_category(), socket.string());
}

OwnedDescriptor listen_at(const std::filesystem::path &socket) {
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    const std::string text = socket.string();
    if (text.size() >= sizeof address.sun_path) {
        fail(ENAMETOOLONG, socket);
    }
    std::ranges::copy(text, std::begin(address.sun_path));
    OwnedDescriptor listener(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
    unlink(socket.c_str());
    if (bind(listener.get(), reinterpret_cast<const sockaddr *>(&address), sizeof address) != 0 ||
        listen(listener.get(), 1) != 0) {
        fail(errno, socket);
    }
    return listener;
}

std::int64_t now_us() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return std::chrono::duration_cast<std::chrono::microseconds>(now).count();
}

// Up to the next answer, rounded up so that it is due when the wait ends.
int timeout_ms(const QemuLink &link) {
    const auto next = link.next_us();
    if (!next) {
        return -1;
    }
    const std::int64_t left_ms = (*next - now_us() + 999) / 1000;
    return static_cast<int>(std::clamp<std::int64_t>(left_ms, 0, std::numeric_limits<int>::max()));
}

// Returns whether `descriptor` rather than `stop` has something, or the time is over.
bool wait_for(int descriptor, int stop, int limit_ms) {
    std::array<pollfd, 2> set{pollfd{descriptor, POLLIN, 0}, pollfd{stop, POLLIN, 0}};
    while (poll(set.data(), set.size(), limit_ms) < 0 && errno == EINTR) {
    }
    return set[1].revents == 0;
}

bool send_all(int descriptor, std::span<const std::uint8_t> bytes) {
    while (!bytes.empty()) {
        const ssize_t sent = send(descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (sent <= 0) {
            return false;
        }
        bytes = bytes.subspan(static_cast<std::size_t>(sent));
    }
    return true;
}

// Returns false at the connection's end; nothing to read is no end.
bool receive_into(QemuLink &link, int descriptor) {
    std::array<std::uint8_t, 512> buffer{};
    const ssize_t count = recv(descriptor, buffer.data(), buffer.size(), MSG_DONTWAIT);
    if (count > 0) {
        link.receive(std::span(buffer).first(static_cast<std::size_t>(count)), now_us());
    }
    return count > 0 || (count < 0 && (errno == EAGAIN || errno == EINTR));
}

}  // namespace

OwnedDescriptor::~OwnedDescriptor() {
    if (is_open()) {
        close(descriptor_);
    }
}

OwnedDescriptor::OwnedDescriptor(OwnedDescriptor &&other) noexcept
    : descriptor_(std::exchange(other.descriptor_, -1)) {}

OwnedDescriptor &OwnedDescriptor::operator=(OwnedDescriptor &&other) noexcept {
    std::swap(descriptor_, other.descriptor_);
    return *this;
}

QemuServer::QemuServer(std::filesystem::path socket, Controller &controller)
    : socket_(std::move(socket)), controller_(controller), listener_(listen_at(socket_)) {}

QemuServer::~QemuServer() {
    unlink(socket_.c_str());
}

void QemuServer::run(int stop) {
    while (accept_one(stop) && serve_one(stop)) {
    }
}

bool QemuServer::accept_one(int stop) {
    do {
        if (!wait_for(listener_.get(), stop, -1)) {
            return false;
        }
        connection_ = OwnedDescriptor(accept4(listener_.get(), nullptr, nullptr, SOCK_CLOEXEC));
    } while (!connection_.is_open());
    return true;
}

// Returns false when the server is to stop, true when the connection has ended.
bool QemuServer::serve_one(int stop) {
    QemuLink link(controller_);
    const int descriptor = connection_.get();
    do {
        if (!wait_for(descriptor, stop, timeout_ms(link))) {
            return false;
        }
    } while (receive_into(link, descriptor) && send_all(descriptor, link.take_due(now_us())));
    return true;
}

}  // namespace velkhost::bmc
