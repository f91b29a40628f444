// The virtual clock as one thread sees it, and the real one when it is back.
#include <signal.h>
#include <sys/syscall.h>
#include <sys/time.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <chrono>
#include <limits>
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
constexpr std::int64_t kEpoch = 1'500'000'000 * kSecond;

class ShimClock : public testing::Test {
  protected:
    ShimClock() { velkshim_use_virtual_clock(kEpoch); }
    ~ShimClock() override {
        velkshim_observe_pauses(nullptr, nullptr);
        velkshim_use_real_clock();
    }

    static std::int64_t elapsed() { return velkshim_now_us() - kEpoch; }
};

std::int64_t micros(const timespec &time) {
    return time.tv_sec * kSecond + time.tv_nsec / 1000;
}

std::int64_t read_clock(clockid_t clock) {
    timespec now{};
    EXPECT_EQ(clock_gettime(clock, &now), 0);
    return micros(now);
}

TEST_F(ShimClock, TimeStandsStillBetweenPauses) {
    for (int i = 0; i < 1000; ++i) {
        ASSERT_EQ(elapsed(), 0);
    }
}

TEST_F(ShimClock, EveryPauseMovesTimeByItsLength) {
    EXPECT_EQ(sleep(10), 0U);
    EXPECT_EQ(elapsed(), 10 * kSecond);
    EXPECT_EQ(usleep(250), 0);
    EXPECT_EQ(elapsed(), 10 * kSecond + 250);
    const timespec length{1, 500'000'000};
    EXPECT_EQ(nanosleep(&length, nullptr), 0);
    EXPECT_EQ(clock_nanosleep(CLOCK_MONOTONIC, 0, &length, nullptr), 0);
    EXPECT_EQ(elapsed(), 13 * kSecond + 250);
    std::this_thread::sleep_for(std::chrono::seconds(2));
    EXPECT_EQ(elapsed(), 15 * kSecond + 250);
}

TEST_F(ShimClock, PauseIsNeverShorterThanAskedFor) {
    const timespec length{0, 1};
    EXPECT_EQ(nanosleep(&length, nullptr), 0);
    EXPECT_EQ(elapsed(), 1);
}

TEST_F(ShimClock, PauseUntilATimeEndsAtThatTime) {
    const timespec wall{(kEpoch + 5 * kSecond) / kSecond, 0};
    EXPECT_EQ(clock_nanosleep(CLOCK_REALTIME, TIMER_ABSTIME, &wall, nullptr), 0);
    EXPECT_EQ(elapsed(), 5 * kSecond);
    EXPECT_EQ(clock_nanosleep(CLOCK_REALTIME, TIMER_ABSTIME, &wall, nullptr), 0);
    EXPECT_EQ(elapsed(), 5 * kSecond);
}

TEST_F(ShimClock, BadLengthsAreRefusedAsLibcDoes) {
    const timespec too_many_nanos{0, 1'000'000'000};
    EXPECT_EQ(nanosleep(&too_many_nanos, nullptr), -1);
    EXPECT_EQ(errno, EINVAL);
    EXPECT_EQ(clock_nanosleep(CLOCK_REALTIME, 0, &too_many_nanos, nullptr), EINVAL);
    EXPECT_EQ(elapsed(), 0);
}

TEST_F(ShimClock, AllClocksTellTheSameTime) {
    const std::int64_t monotonic = read_clock(CLOCK_MONOTONIC);
    sleep(3);
    EXPECT_EQ(time(nullptr), 1'500'000'003);
    time_t stored = 0;
    EXPECT_EQ(time(&stored), stored);
    timeval now{};
    EXPECT_EQ(gettimeofday(&now, nullptr), 0);
    EXPECT_EQ(now.tv_sec, 1'500'000'003);
    EXPECT_EQ(read_clock(CLOCK_REALTIME), kEpoch + 3 * kSecond);
    EXPECT_EQ(read_clock(CLOCK_MONOTONIC), monotonic + 3 * kSecond);
    EXPECT_EQ(read_clock(CLOCK_BOOTTIME), monotonic + 3 * kSecond);
}

TEST_F(ShimClock, TimesBeforeTheEpochAreSplitDownwards) {
    velkshim_use_virtual_clock(-1);
    timeval now{};
    gettimeofday(&now, nullptr);
    EXPECT_EQ(now.tv_sec, -1);
    EXPECT_EQ(now.tv_usec, 999'999);
    EXPECT_EQ(time(nullptr), -1);
}

TEST_F(ShimClock, PauseBeyondTheEndOfTimeEndsThere) {
    velkshim_use_virtual_clock(std::numeric_limits<std::int64_t>::max() - 5);
    EXPECT_EQ(sleep(std::numeric_limits<unsigned>::max()), 0U);
    EXPECT_EQ(velkshim_now_us(), std::numeric_limits<std::int64_t>::max());
}

TEST_F(ShimClock, ProcessorTimeStaysTheMachines) {
    const std::int64_t before = read_clock(CLOCK_PROCESS_CPUTIME_ID);
    sleep(3600);
    EXPECT_LT(read_clock(CLOCK_PROCESS_CPUTIME_ID) - before, 3600 * kSecond);
}

struct Pauses {
    std::vector<std::int64_t> begun_us;
    std::int64_t total_us = 0;

    static void count(void *context, std::int64_t now_us, std::int64_t length_us) {
        auto &self = *static_cast<Pauses *>(context);
        self.begun_us.push_back(now_us);
        self.total_us += length_us;
    }
};

TEST_F(ShimClock, PauseObserverIsToldBeginAndLengthOfEachPause) {
    Pauses pauses;
    velkshim_observe_pauses(Pauses::count, &pauses);
    sleep(10);
    usleep(7);
    EXPECT_EQ(pauses.begun_us, (std::vector<std::int64_t>{kEpoch, kEpoch + 10 * kSecond}));
    EXPECT_EQ(pauses.total_us, 10 * kSecond + 7);
}

TEST_F(ShimClock, TwoHoursOfPollsAreSevenHundredAndTwentyPauses) {
    Pauses pauses;
    velkshim_observe_pauses(Pauses::count, &pauses);
    while (elapsed() < 2 * 3600 * kSecond) {
        sleep(10);
    }
    EXPECT_EQ(pauses.begun_us.size(), 720U);
    EXPECT_EQ(pauses.total_us, 2 * 3600 * kSecond);
}

TEST_F(ShimClock, PauseObserverWorksUnderTheRealClock) {
    velkshim_use_real_clock();
    Pauses pauses;
    velkshim_observe_pauses(Pauses::count, &pauses);
    usleep(1);
    EXPECT_EQ(pauses.begun_us.size(), 1U);
    EXPECT_EQ(pauses.total_us, 1);
}

// The kernel's own answer, past every definition of clock_gettime.
std::int64_t machine_time() {
    timespec now{};
    syscall(SYS_clock_gettime, CLOCK_REALTIME, &now);
    return micros(now);
}

TEST_F(ShimClock, RealClockComesBack) {
    sleep(1000);
    velkshim_use_real_clock();
    const std::int64_t before = machine_time();
    const std::int64_t shown = velkshim_now_us();
    EXPECT_GE(shown, before);
    EXPECT_GE(read_clock(CLOCK_REALTIME), shown);
    EXPECT_GE(time(nullptr), before / kSecond - 1);
    const std::int64_t monotonic = read_clock(CLOCK_MONOTONIC);
    usleep(1000);
    EXPECT_GE(read_clock(CLOCK_MONOTONIC), monotonic + 1000);
}

TEST_F(ShimClock, ClockCanBeStartedAgainFromAnotherTime) {
    sleep(1000);
    velkshim_use_virtual_clock(42 * kSecond);
    EXPECT_EQ(time(nullptr), 42);
    sleep(1);
    EXPECT_EQ(time(nullptr), 43);
}

#if !defined(__SANITIZE_THREAD__)  // which begins threads at once

// What comes at the same time is no matter of chance: one thread goes on after the other.
TEST_F(ShimClock, ThreadsBeginInTheOrderOfTheirMakingWhenTheirMakerPauses) {
    const TakePart taking_part;
    std::mutex mutex;
    std::string order;
    const auto note = [&](char name) {
        const std::lock_guard lock(mutex);
        order += name;
    };
    std::vector<std::thread> threads;
    for (const char name : {'a', 'b', 'c', 'd'}) {
        threads.emplace_back([&note, name] {
            note(name);
            sleep(10);
            note(name);
        });
    }
    note('0');
    sleep(10);
    note('1');
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(order, "0abcd1abcd");
    EXPECT_EQ(elapsed(), 10 * kSecond);
}

#endif

// A thread pauses for an hour while the test's own thread takes part and runs, so that no time can
// pass; signals arrive until the pause has ended.
class ShimSignals : public ShimClock {
  protected:
    ShimSignals() {
        ended = false;
        handled_at = 0;
        left = 0;
    }

    void interrupt(int flags, void *(*pausing)(void *)) {
        struct sigaction action {};
        action.sa_handler = [](int) { handled_at = velkshim_now_us(); };
        action.sa_flags = flags;
        sigaction(SIGUSR1, &action, nullptr);
        const TakePart taking_part;
        pthread_t thread{};
        ASSERT_EQ(pthread_create(&thread, nullptr, pausing, nullptr), 0);
        usleep(0);  // the thread's turn: until its pause
        while (!ended) {
            pthread_kill(thread, SIGUSR1);
            std::this_thread::yield();
        }
        pthread_join(thread, nullptr);
        EXPECT_EQ(handled_at, kEpoch);
        EXPECT_EQ(elapsed(), 0);
    }

    static inline std::atomic<bool> ended{false};
    static inline std::atomic<std::int64_t> handled_at{0};
    static inline std::atomic<unsigned> left{0};
};

TEST_F(ShimSignals, SleepTellsHowMuchWasLeft) {
    interrupt(0, [](void *) -> void * {
        left = sleep(3600);
        ended = true;
        return nullptr;
    });
    EXPECT_EQ(left, 3600U);
}

TEST_F(ShimSignals, PausesEndAlsoWhereCallsAreRestarted) {
    interrupt(SA_RESTART, [](void *) -> void * {
        const timespec length{3600, 0};
        timespec rest{};
        EXPECT_EQ(nanosleep(&length, &rest), -1);
        EXPECT_EQ(errno, EINTR);
        left = static_cast<unsigned>(rest.tv_sec);
        ended = true;
        return nullptr;
    });
    EXPECT_EQ(left, 3600U);
}

TEST_F(ShimClock, PauseThatSucceedsLeavesErrnoAlone) {
    errno = EINTR;
    EXPECT_EQ(usleep(5), 0);
    const timespec length{1, 0};
    EXPECT_EQ(nanosleep(&length, nullptr), 0);
    EXPECT_EQ(errno, EINTR);
}

TEST_F(ShimSignals, UsleepReportsTheInterruption) {
    interrupt(0, [](void *) -> void * {
        EXPECT_EQ(usleep(999'999), -1);
        EXPECT_EQ(errno, EINTR);
        ended = true;
        return nullptr;
    });
}

// The child has the forking thread alone, whatever the others did.
TEST_F(ShimClock, ForkedChildKeepsAClockOfItsOwn) {
    const TakePart taking_part;
    std::thread busy([] { sleep(100); });
    const pid_t child = fork();
    if (child == 0) {
        sleep(10);
        _exit(elapsed() == 10 * kSecond ? 0 : 1);
    }
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(elapsed(), 0);
    busy.join();
    EXPECT_EQ(elapsed(), 100 * kSecond);
}

}  // namespace
}  // namespace velkhost::shim::test
