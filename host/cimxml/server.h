// The HTTP server in front of an endpoint.
//
// One thread waits for all connections and puts requests together; a bounded number of workers
// answers them, each request on one worker. A request that is slow holds up no other as long as
// there is a worker left. Workers take part in the virtual clock while they answer.
#pragma once

#include "host/cimxml/connection.h"
#include "host/cimxml/endpoint.h"
#include "host/cimxml/listener.h"

#include <atomic>
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

namespace velkhost::cimxml {

struct ServerOptions {
    ListenAddress address = {"127.0.0.1", 0};
    std::size_t workers = 8;
    std::size_t connections = 256;  // those beyond are told 503
    HttpLimits limits = {};
    std::int64_t idle_ms = 60'000;     // after which a connection without a request is closed
    std::int64_t request_ms = 20'000;  // within which a request that has begun must be complete
    int send_ms = 10'000;              // for how long a client may refuse a piece of a response
};

class Server {
  public:
    // Listens and serves from here on. `endpoint` must outlive the server. Signals that the caller
    // blocks are blocked in the server's threads, too. Throws ListenError.
    Server(const Endpoint &endpoint, ServerOptions options);

    // Stops, and waits for the requests that are being answered.
    ~Server();
    Server(const Server &) = delete;
    Server &operator=(const Server &) = delete;

    // With the port that was chosen.
    [[nodiscard]] const ListenAddress &address() const { return options_.address; }

    // Requests that are being answered or wait for a worker, and those that were answered.
    [[nodiscard]] std::size_t active() const { return active_.load(); }
    [[nodiscard]] std::uint64_t answered() const { return answered_.load(); }

    // Takes no connection and no request any more; those under way are answered, and not waited
    // for.
    void close();

  private:
    using ConnectionPointer = std::shared_ptr<Connection>;

    void run_loop();
    void accept_clients();
    void take_event(std::uint64_t id);
    void close_idle();
    void refuse(const Descriptor &fd) const;

    void run_worker();
    void submit(std::uint64_t id, ConnectionPointer connection);
    void answer(std::uint64_t id, const ConnectionPointer &connection);
    // Whether the connection goes on.
    bool answer_one(Connection &connection);

    void arm(std::uint64_t id, const ConnectionPointer &connection);
    void drop(std::uint64_t id);

    const Endpoint &endpoint_;
    ServerOptions options_;
    Descriptor listener_;
    Descriptor epoll_;
    Descriptor wake_;
    std::atomic<bool> closing_{false};
    std::atomic<std::size_t> active_{0};
    std::atomic<std::uint64_t> answered_{0};

    std::mutex mutex_;  // guards what follows
    std::condition_variable work_;
    std::map<std::uint64_t, ConnectionPointer> waiting_;  // those of the event loop
    std::size_t open_ = 0;                                // connections in all
    std::uint64_t last_id_ = 0;
    std::deque<std::pair<std::uint64_t, ConnectionPointer>> queue_;
    bool ended_ = false;  // no more work will come

    std::thread loop_;
    std::vector<std::thread> workers_;
};

}  // namespace velkhost::cimxml
