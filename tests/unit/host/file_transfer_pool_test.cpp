// Threads for transfers: never more than the bound, and everything gets its turn.
#include "host/providers/file_transfer/worker_pool.h"

#include <gtest/gtest.h>

#include <atomic>
#include <semaphore>

namespace velkhost::providers {
namespace {

TEST(TransferPool, EverythingRunsAndNoMoreThanTheBoundAtOnce) {
    constexpr int kTasks = 50;
    std::atomic<int> running{0};
    std::atomic<int> most{0};
    std::counting_semaphore<kTasks> done(0);
    WorkerPool pool(3);
    for (int i = 0; i < kTasks; ++i) {
        pool.post([&](const std::stop_token & /*stop*/) {
            const int now = ++running;
            int known = most.load();
            while (now > known && !most.compare_exchange_weak(known, now)) {
            }
            std::this_thread::yield();
            --running;
            done.release();
        });
    }
    for (int i = 0; i < kTasks; ++i) {
        done.acquire();
    }
    EXPECT_LE(most.load(), 3);
    EXPECT_GE(most.load(), 1);
}

TEST(TransferPool, SecondTaskOfAPoolOfOneWaitsForTheFirst) {
    std::binary_semaphore go(0);
    std::binary_semaphore done(0);
    std::atomic<bool> first_ended{false};
    std::atomic<bool> in_order{false};
    WorkerPool pool(1);
    pool.post([&](const std::stop_token & /*stop*/) {
        go.acquire();
        first_ended = true;
    });
    pool.post([&](const std::stop_token & /*stop*/) {
        in_order = first_ended.load();
        done.release();
    });
    go.release();
    done.acquire();
    EXPECT_TRUE(in_order);
}

TEST(TransferPool, EndAsksTheRunningToStopAndDropsTheWaiting) {
    std::binary_semaphore begun(0);
    std::atomic<bool> saw_stop{false};
    std::atomic<bool> second_ran{false};
    {
        WorkerPool pool(1);
        pool.post([&](const std::stop_token &stop) {
            begun.release();
            while (!stop.stop_requested()) {
                std::this_thread::yield();
            }
            saw_stop = true;
        });
        begun.acquire();
        pool.post([&](const std::stop_token & /*stop*/) { second_ran = true; });
    }
    EXPECT_TRUE(saw_stop);
    EXPECT_FALSE(second_ran);
}

}  // namespace
}  // namespace velkhost::providers
