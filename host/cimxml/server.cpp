#include "host/cimxml/server.h"

#include "host/shim/wait_guard.h"

#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/epoll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <exception>
#include <utility>

namespace velkhost::cimxml {
namespace {

// Ids of the two descriptors that are no connections.
constexpr std::uint64_t kListener = 0;
constexpr std::uint64_t kWake = 1;
constexpr std::uint64_t kFirstConnection = 2;

Descriptor checked(int fd, const char *what) {
    if (fd < 0) {
        throw ListenError(std::string("cannot make ") + what + ": " + std::strerror(errno));
    }
    return Descriptor(fd);
}

void watch(const Descriptor &epoll, int fd, std::uint64_t id, int action, std::uint32_t events) {
    epoll_event event{};
    event.events = events;
    event.data.u64 = id;
    epoll_ctl(epoll.get(), action, fd, &event);
}

HttpResponse refusal(const HttpReader &reader) {
    HttpResponse response = bare_response(reader.status());
    response.fields.push_back({"Content-Type", "text/plain"});
    response.body = reader.error() + "\n";
    response.close = true;
    return response;
}

HttpResponse answer_to(const Endpoint &endpoint, const HttpRequest &request) {
    try {
        return endpoint.answer(request);
    } catch (const std::exception &) {  // out of memory, say
        HttpResponse response = bare_response(500);
        response.close = true;
        return response;
    }
}

}  // namespace

// -- Life --

Server::Server(const Endpoint &endpoint, ServerOptions options)
    : endpoint_(endpoint),
      options_(std::move(options)),
      listener_(listen_on(options_.address)),
      epoll_(checked(epoll_create1(EPOLL_CLOEXEC), "an event queue")),
      wake_(checked(eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC), "an event")),
      last_id_(kFirstConnection) {
    watch(epoll_, listener_.get(), kListener, EPOLL_CTL_ADD, EPOLLIN);
    watch(epoll_, wake_.get(), kWake, EPOLL_CTL_ADD, EPOLLIN);
    loop_ = std::thread([this] { run_loop(); });
    for (std::size_t i = 0; i < options_.workers; ++i) {
        workers_.emplace_back([this] { run_worker(); });
    }
}

Server::~Server() {
    close();
    {
        const std::lock_guard lock(mutex_);
        ended_ = true;
    }
    work_.notify_all();
    for (std::thread &worker : workers_) {
        worker.join();
    }
}

void Server::close() {
    closing_ = true;
    const std::uint64_t one = 1;
    [[maybe_unused]] const ssize_t count = write(wake_.get(), &one, sizeof one);
    if (loop_.joinable()) {
        loop_.join();
    }
}

// -- The event loop --

void Server::run_loop() {
    constexpr int kSweepMs = 1000;
    velkshim_thread_leave();  // it has no business with the host's time
    std::array<epoll_event, 64> events{};
    while (!closing_) {
        const int count =
            epoll_wait(epoll_.get(), events.data(), static_cast<int>(events.size()), kSweepMs);
        for (int i = 0; i < count; ++i) {
            const std::uint64_t id = events.at(static_cast<std::size_t>(i)).data.u64;
            if (id == kListener) {
                accept_clients();
            } else if (id != kWake) {
                take_event(id);
            }
        }
        close_idle();
    }
    listener_.reset();
    const std::lock_guard lock(mutex_);
    open_ -= waiting_.size();
    waiting_.clear();
}

void Server::accept_clients() {
    while (true) {
        Descriptor fd(accept4(listener_.get(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC));
        if (fd.get() < 0) {
            return;
        }
        const int on = 1;
        setsockopt(fd.get(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
        std::uint64_t id = 0;
        ConnectionPointer connection;
        {
            const std::lock_guard lock(mutex_);
            if (open_ < options_.connections) {
                ++open_;
                id = ++last_id_;
                connection = std::make_shared<Connection>(std::move(fd), options_.limits);
                waiting_[id] = connection;
            }
        }
        if (connection == nullptr) {
            refuse(fd);
        } else {
            watch(epoll_, connection->fd(), id, EPOLL_CTL_ADD, EPOLLIN | EPOLLONESHOT);
        }
    }
}

void Server::refuse(const Descriptor &fd) const {
    HttpResponse response = bare_response(503);
    response.close = true;
    const std::string bytes = response.bytes();
    [[maybe_unused]] const ssize_t count =
        send(fd.get(), bytes.data(), bytes.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
}

void Server::take_event(std::uint64_t id) {
    ConnectionPointer connection;
    {
        const std::lock_guard lock(mutex_);
        const auto place = waiting_.find(id);
        if (place == waiting_.end()) {
            return;
        }
        connection = place->second;
    }
    const Connection::Reading reading = connection->read();
    if (connection->reader().wants_leave()) {
        connection->send("HTTP/1.1 100 Continue\r\n\r\n", 0);
    }
    if (reading == Connection::Reading::kGone) {
        drop(id);
    } else if (reading == Connection::Reading::kAnswer) {
        submit(id, std::move(connection));
    } else {
        watch(epoll_, connection->fd(), id, EPOLL_CTL_MOD, EPOLLIN | EPOLLONESHOT);
    }
}

// A client that has begun a request is not waited for as long as one that may yet come back.
void Server::close_idle() {
    const std::int64_t now = machine_ms();
    const std::lock_guard lock(mutex_);
    open_ -= std::erase_if(waiting_, [this, now](const auto &entry) {
        Connection &connection = *entry.second;
        const bool idle = connection.reader().is_idle();
        return now - connection.since_ms() > (idle ? options_.idle_ms : options_.request_ms);
    });
}

// -- Workers --

void Server::submit(std::uint64_t id, ConnectionPointer connection) {
    ++active_;
    {
        const std::lock_guard lock(mutex_);
        waiting_.erase(id);
        queue_.emplace_back(id, std::move(connection));
    }
    work_.notify_one();
}

void Server::run_worker() {
    while (true) {
        std::pair<std::uint64_t, ConnectionPointer> job;
        {
            std::unique_lock lock(mutex_);
            const shim::WaitGuard waiting;
            work_.wait(lock, [this] { return ended_ || !queue_.empty(); });
            if (queue_.empty()) {
                return;
            }
            job = std::move(queue_.front());
            queue_.pop_front();
        }
        answer(job.first, job.second);
        --active_;
    }
}

void Server::answer(std::uint64_t id, const ConnectionPointer &connection) {
    while (answer_one(*connection)) {
        if (connection->reader().state() == HttpReader::State::kIncomplete) {
            arm(id, connection);
            return;
        }
    }
    drop(id);
}

bool Server::answer_one(Connection &connection) {
    if (connection.reader().state() == HttpReader::State::kBroken) {
        if (connection.send(refusal(connection.reader()).bytes(), options_.send_ms)) {
            connection.finish();
        }
        return false;
    }
    const HttpRequest request = connection.reader().take();
    HttpResponse response = answer_to(endpoint_, request);
    response.close = response.close || closing_;
    ++answered_;
    return connection.send(response.bytes(), options_.send_ms) && !response.close;
}

// Back to the event loop, which has nothing to do with it before the last line.
void Server::arm(std::uint64_t id, const ConnectionPointer &connection) {
    {
        const std::lock_guard lock(mutex_);
        waiting_[id] = connection;
    }
    watch(epoll_, connection->fd(), id, EPOLL_CTL_MOD, EPOLLIN | EPOLLONESHOT);
}

void Server::drop(std::uint64_t id) {
    const std::lock_guard lock(mutex_);
    waiting_.erase(id);
    --open_;
}

}  // namespace velkhost::cimxml
