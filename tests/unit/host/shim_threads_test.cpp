// The virtual clock among several threads: who is woken when, and who holds time up.
#include <pthread.h>
#include <unistd.h>

#include <atomic>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "host/shim/velkshim.h"
#include "host/shim/wait_guard.h"

namespace velkhost::shim::test {
namespace {

constexpr std::int64_t kSecond = 1'000'000;

std::int64_t seconds_now() {
    return velkshim_now_us() / kSecond;
}

class ShimThreads : public testing::Test {
  protected:
    ShimThreads() { velkshim_use_virtual_clock(0); }
    ~ShimThreads() override { velkshim_use_real_clock(); }

    void note(const std::string &what) {
        const std::lock_guard lock(mutex_);
        notes_.push_back(std::to_string(seconds_now()) + " " + what);
    }

    using Notes = std::vector<std::string>;
    std::mutex mutex_;
    Notes notes_;
};

TEST_F(ShimThreads, SleepersWakeInTheOrderOfTheirTimes) {
    const TakePart taking_part;
    std::vector<std::thread> threads;
    for (const unsigned length : {30U, 10U, 20U}) {
        threads.emplace_back([this, length] {
            sleep(length);
            note("woken");
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(notes_, (Notes{"10 woken", "20 woken", "30 woken"}));
}

TEST_F(ShimThreads, TiesGoByArrival) {
    const TakePart taking_part;
    // The first arrives at 1 s, the second at 2 s, the third at 3 s; all are due at 10 s.
    std::vector<std::thread> threads;
    for (const unsigned arrival : {3U, 1U, 2U}) {
        threads.emplace_back([this, arrival] {
            sleep(arrival);
            sleep(10 - arrival);
            note(std::to_string(arrival));
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(notes_, (Notes{"10 1", "10 2", "10 3"}));
}

TEST_F(ShimThreads, OneSleeperRunsAtATime) {
    const TakePart taking_part;
    std::atomic<int> awake{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([&awake] {
            for (int pause = 0; pause < 100; ++pause) {
                sleep(1);
                EXPECT_EQ(++awake, 1);
                std::this_thread::yield();
                --awake;
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(seconds_now(), 100);
}

TEST_F(ShimThreads, PauseOfNoLengthLetsEqualsGoFirst) {
    const TakePart taking_part;
    std::thread other([this] {
        sleep(1);
        note("other");
    });
    sleep(1);  // whichever of the two is woken first lets the other one pass
    usleep(0);
    note("yielded");
    other.join();
    EXPECT_EQ(notes_, (Notes{"1 other", "1 yielded"}));
}

TEST_F(ShimThreads, ChildTakesPartFromItsCreationOn) {
    const TakePart taking_part;
    for (int round = 0; round < 100; ++round) {
        const std::int64_t begin = seconds_now();
        std::atomic<std::int64_t> seen{-1};
        std::thread child([&seen] {
            for (int i = 0; i < 20; ++i) {
                std::this_thread::yield();
            }
            seen = seconds_now();
        });
        sleep(10);  // may not end before the child has paused or ended
        ASSERT_EQ(seen, begin);
        child.join();
        ASSERT_EQ(seconds_now(), begin + 10);
    }
}

TEST_F(ShimThreads, ThreadThatEndsStopsCounting) {
    const TakePart taking_part;
    for (int round = 0; round < 100; ++round) {
        std::thread([] { usleep(1); }).detach();
        std::thread([] {}).detach();
    }
    sleep(10);
    EXPECT_EQ(seconds_now(), 10);
}

TEST_F(ShimThreads, ThreadThatExitsEarlyStopsCounting) {
    const TakePart taking_part;
    pthread_t thread{};
    const auto body = [](void *) -> void * {
        sleep(1);
        pthread_exit(nullptr);
    };
    ASSERT_EQ(pthread_create(&thread, nullptr, body, nullptr), 0);
    sleep(10);
    EXPECT_EQ(seconds_now(), 10);
    EXPECT_EQ(pthread_join(thread, nullptr), 0);
}

TEST_F(ShimThreads, PauseInAThreadLocalDestructorStillCounts) {
    struct PausesAtTheEnd {
        int touched = 0;
        ~PausesAtTheEnd() { sleep(5); }
    };
    const TakePart taking_part;
    std::thread thread([] {
        static thread_local PausesAtTheEnd object;
        object.touched = 1;
    });
    thread.join();
    EXPECT_EQ(seconds_now(), 5);
}

TEST_F(ShimThreads, CreationThatFailsHoldsNothingUp) {
    const TakePart taking_part;
    velkshim_set_fault_hook([](void *, const char *) { return EAGAIN; }, nullptr);
    pthread_t thread{};
    const auto body = [](void *argument) -> void * { return argument; };
    EXPECT_EQ(pthread_create(&thread, nullptr, body, nullptr), EAGAIN);
    velkshim_set_fault_hook(nullptr, nullptr);
    pthread_attr_t impossible;
    pthread_attr_init(&impossible);
    cpu_set_t no_processor;
    CPU_ZERO(&no_processor);
    pthread_attr_setaffinity_np(&impossible, sizeof(no_processor), &no_processor);
    EXPECT_NE(pthread_create(&thread, &impossible, body, nullptr), 0);
    pthread_attr_destroy(&impossible);
    sleep(10);
    EXPECT_EQ(seconds_now(), 10);
}

TEST_F(ShimThreads, JoinLetsTimePassUntilTheThreadEnds) {
    const TakePart taking_part;
    std::thread thread([] {
        sleep(60);
        sleep(40);
    });
    thread.join();
    EXPECT_EQ(seconds_now(), 100);
}

// The others would go on at once, were the end of the joined thread not the joiner's turn.
TEST_F(ShimThreads, NoTimePassesBetweenTheEndOfAThreadAndTheReturnOfItsJoin) {
    const TakePart taking_part;
    std::atomic<bool> done{false};
    std::thread ticker([&done] {
        while (!done) {
            usleep(1000);
        }
    });
    for (std::int64_t round = 1; round <= 200; ++round) {
        std::thread thread([] { sleep(1); });
        thread.join();
        ASSERT_EQ(velkshim_now_us(), round * kSecond);
    }
    done = true;
    ticker.join();
}

TEST_F(ShimThreads, JoinOfAThreadThatHasEndedTakesNoTime) {
    const TakePart taking_part;
    std::atomic<bool> done{false};
    std::thread ticker([&done] {
        while (!done) {
            usleep(1000);
        }
    });
    for (std::int64_t round = 1; round <= 100; ++round) {
        std::thread thread([] { usleep(500'000); });
        sleep(1);
        thread.join();
        ASSERT_EQ(velkshim_now_us(), round * kSecond);
    }
    done = true;
    ticker.join();
}

TEST_F(ShimThreads, JoinHandsTheResultOn) {
    const TakePart taking_part;
    pthread_t thread{};
    int value = 7;
    const auto body = [](void *argument) -> void * {
        sleep(1);
        return argument;
    };
    ASSERT_EQ(pthread_create(&thread, nullptr, body, &value), 0);
    void *result = nullptr;
    EXPECT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, &value);
}

TEST_F(ShimThreads, JoinOfItselfIsRefusedAsLibcDoes) {
    const TakePart taking_part;
    EXPECT_EQ(pthread_join(pthread_self(), nullptr), EDEADLK);
    sleep(1);
    EXPECT_EQ(seconds_now(), 1);
}

TEST_F(ShimThreads, ThreadThatDoesNotTakePartHoldsNothingUp) {
    std::atomic<bool> done{false};
    std::thread bystander([&done] {
        while (!done) {
            std::this_thread::yield();
        }
    });
    sleep(10);  // takes part from here on; the bystander was created before
    EXPECT_EQ(seconds_now(), 10);
    done = true;
    bystander.join();
}

TEST_F(ShimThreads, ThreadThatLeftHoldsNothingUp) {
    const TakePart taking_part;
    std::atomic<bool> done{false};
    std::thread runner([&done] {
        velkshim_thread_leave();
        while (!done) {
            std::this_thread::yield();
        }
    });
    sleep(10);
    EXPECT_EQ(seconds_now(), 10);
    done = true;
    runner.join();
}

TEST_F(ShimThreads, WaitLetsTimePassForTheOthers) {
    const TakePart taking_part;
    std::condition_variable changed;
    bool done = false;
    std::thread thread([&] {
        sleep(30);
        const std::lock_guard lock(mutex_);
        done = true;
        changed.notify_one();
    });
    {
        std::unique_lock lock(mutex_);
        const WaitGuard waiting;
        const WaitGuard nested;
        changed.wait(lock, [&done] { return done; });
    }
    EXPECT_EQ(seconds_now(), 30);
    sleep(1);
    EXPECT_EQ(seconds_now(), 31);
    thread.join();
}

TEST_F(ShimThreads, PauseInsideAWaitIsAPause) {
    const TakePart taking_part;
    {
        const WaitGuard waiting;
        sleep(5);
        EXPECT_EQ(seconds_now(), 5);
    }
    sleep(5);
    EXPECT_EQ(seconds_now(), 10);
}

TEST_F(ShimThreads, GuardsOfAThreadThatDoesNotTakePartDoNothing) {
    velkshim_wait_begin();
    velkshim_wait_end();
    velkshim_wait_end();
    velkshim_thread_leave();
    sleep(1);
    EXPECT_EQ(seconds_now(), 1);
}

TEST_F(ShimThreads, EndOfTheVirtualClockCutsAllPausesShort) {
    velkshim_thread_enter();
    std::atomic<unsigned> left{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < 3; ++i) {
        threads.emplace_back([&left] { left += sleep(100); });
    }
    sleep(1);  // ends when the others have begun their pauses
    velkshim_use_real_clock();
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(left, 3 * 99U);
}

// Time to the microsecond, whatever the machine does in between.
TEST_F(ShimThreads, RunsOfManyThreadsAreRepeatable) {
    std::vector<Notes> runs;
    for (int run = 0; run < 5; ++run) {
        velkshim_use_virtual_clock(0);
        const TakePart taking_part;
        notes_.clear();
        std::vector<std::thread> threads;
        for (unsigned i = 0; i < 8; ++i) {
            usleep(1);  // gives the threads an order of arrival
            threads.emplace_back([this, i] {
                for (unsigned k = 1; k <= 20; ++k) {
                    sleep(1 + (i * k) % 7);
                    note(std::to_string(i));
                }
            });
        }
        for (std::thread &thread : threads) {
            thread.join();
        }
        runs.push_back(notes_);
        EXPECT_EQ(notes_.size(), 160U);
        EXPECT_EQ(runs.front(), notes_);
    }
}

}  // namespace
}  // namespace velkhost::shim::test
