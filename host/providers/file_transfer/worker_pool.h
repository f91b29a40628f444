// Threads that come when there is work and go when there is none, up to a bound.
#pragma once

#include <cstddef>
#include <deque>
#include <functional>
#include <list>
#include <mutex>
#include <stop_token>
#include <thread>

namespace velkhost::providers {

// Safe to use from any thread.
class WorkerPool {
  public:
    // Throws nothing. The token tells that the pool ends.
    using Task = std::function<void(const std::stop_token &)>;

    // `most` is at least 1.
    explicit WorkerPool(std::size_t most) : most_(most) {}
    // Asks the running tasks to stop, drops the others, and waits.
    ~WorkerPool();
    WorkerPool(const WorkerPool &) = delete;
    WorkerPool &operator=(const WorkerPool &) = delete;

    // Runs the task now, or when an earlier one has ended. Throws std::system_error, and takes no
    // task, when there is no thread at all and none can be made.
    void post(Task task);

  private:
    struct Worker {
        std::thread thread;
        bool has_ended = false;
    };

    void work(Worker &self);
    void join_ended();

    const std::size_t most_;
    std::mutex mutex_;  // guards all below
    std::deque<Task> waiting_;
    std::list<Worker> workers_;
    std::size_t busy_ = 0;
    std::stop_source stop_;
};

}  // namespace velkhost::providers
