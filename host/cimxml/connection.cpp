#include "host/cimxml/connection.h"

#include "host/shim/wait_guard.h"

#include <poll.h>
#include <sys/socket.h>

#include <array>
#include <cerrno>

namespace velkhost::cimxml {

Connection::Reading Connection::read() {
    std::array<char, 65536> buffer;
    if (reader_.is_idle()) {
        since_ms_ = machine_ms();
    }
    while (reader_.state() == HttpReader::State::kIncomplete) {
        const ssize_t count = recv(fd(), buffer.data(), buffer.size(), MSG_DONTWAIT);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count < 0 && errno == EAGAIN) {
            return Reading::kMore;
        }
        if (count <= 0) {
            return Reading::kGone;
        }
        reader_.feed({buffer.data(), static_cast<std::size_t>(count)});
    }
    return Reading::kAnswer;
}

bool Connection::send(std::string_view bytes, int patience_ms) {
    while (!bytes.empty()) {
        const ssize_t count = ::send(fd(), bytes.data(), bytes.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
        if (count >= 0) {
            bytes.remove_prefix(static_cast<std::size_t>(count));
            continue;
        }
        if (errno != EAGAIN && errno != EINTR) {
            return false;
        }
        const shim::WaitGuard waiting;
        pollfd writable = {fd(), POLLOUT, 0};
        if (poll(&writable, 1, patience_ms) == 0) {
            return false;
        }
    }
    since_ms_ = machine_ms();
    return true;
}

void Connection::finish() {
    constexpr int kPatienceMs = 200;
    constexpr int kMostReads = 128;
    shutdown(fd(), SHUT_WR);
    const shim::WaitGuard waiting;
    std::array<char, 65536> buffer;
    for (int i = 0; i < kMostReads; ++i) {
        pollfd readable = {fd(), POLLIN, 0};
        if (poll(&readable, 1, kPatienceMs) <= 0 ||
            recv(fd(), buffer.data(), buffer.size(), MSG_DONTWAIT) <= 0) {
            return;
        }
    }
}

}  // namespace velkhost::cimxml
