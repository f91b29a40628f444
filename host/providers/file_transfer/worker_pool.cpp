#include "host/providers/file_transfer/worker_pool.h"

#include <system_error>
#include <utility>

namespace velkhost::providers {

WorkerPool::~WorkerPool() {
    stop_.request_stop();
    {
        const std::lock_guard lock(mutex_);
        waiting_.clear();
    }
    for (Worker &worker : workers_) {
        worker.thread.join();
    }
}

void WorkerPool::post(Task task) {
    const std::lock_guard lock(mutex_);
    join_ended();
    waiting_.push_back(std::move(task));
    if (busy_ == most_) {
        return;
    }
    Worker &worker = workers_.emplace_back();
    try {
        worker.thread = std::thread([this, &worker] { work(worker); });
        ++busy_;
    } catch (const std::system_error &) {
        workers_.pop_back();
        if (busy_ == 0) {
            waiting_.pop_back();
            throw;
        }
    }
}

void WorkerPool::work(Worker &self) {
    while (true) {
        Task task;
        {
            const std::lock_guard lock(mutex_);
            if (waiting_.empty()) {
                --busy_;
                self.has_ended = true;
                return;
            }
            task = std::move(waiting_.front());
            waiting_.pop_front();
        }
        task(stop_.get_token());
    }
}

void WorkerPool::join_ended() {
    workers_.remove_if([](Worker &worker) {
        if (worker.has_ended) {
            worker.thread.join();
        }
        return worker.has_ended;
    });
}

}  // namespace velkhost::providers
