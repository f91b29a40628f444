// A discrete-event clock. Time stands still while any thread that takes part runs; when all of
// them pause or wait, time jumps to the earliest wake-up and that one sleeper goes on.
#pragma once

#include <pthread.h>

#include <array>
#include <atomic>
#include <cstdint>

#include "host/shim/futex.h"

namespace velkhost::shim {

class VirtualClock {
  public:
    // Begins a new run of the clock at `epoch_us`. Whoever pauses in an earlier run goes on at
    // once, and no thread takes part in the new one yet.
    void start(std::int64_t epoch_us);
    void stop();

    // Lock-free, fit for signal handlers.
    [[nodiscard]] bool is_running() const { return (run_.load() & 1U) != 0; }
    [[nodiscard]] std::int64_t now_us() const { return now_us_.load(); }
    [[nodiscard]] std::int64_t elapsed_us() const { return now_us_.load() - epoch_us_.load(); }

    // Pauses the calling thread, which takes part from here on. Returns what was left of the pause
    // when a signal handler or the end of the clock's run cut it short, else 0.
    std::int64_t pause(std::int64_t length_us);

    void enter();
    void leave();
    void wait_begin();
    void wait_end();

    // The creation of a thread, in its three places. A thread that takes part counts its child
    // before the child exists: `reserve_child` returns the token that the child adopts, or that
    // the parent cancels when there is to be no child after all. `adopted` is set once the child
    // has its place in the order of events. With a turn of its own it returns when all others
    // pause or wait, so that who comes first is no matter of chance; else at once.
    using Token = unsigned;
    [[nodiscard]] Token reserve_child();
    void cancel_child(Token token);
    enum class Begin { kInTurn, kAtOnce };
    void adopt(Token token, Begin begin, Signal &adopted);

    // The end of the calling thread, as the last thing that it does.
    void thread_ends();

    // In the child of a fork only the calling thread is left.
    void reset_after_fork();

    // A wait for the end of `thread`. The ending thread hands its share of the clock to the one
    // that joins it, so that no time passes in between.
    class Join {
      public:
        Join(VirtualClock &clock, pthread_t thread);
        ~Join();
        Join(const Join &) = delete;
        Join &operator=(const Join &) = delete;

      private:
        friend class VirtualClock;
        VirtualClock &clock_;
        pthread_t target_;
        Token run_ = 0;  // 0: the caller does not take part, or there is nothing to wait for
        bool resumed_ = false;
        Join *next_ = nullptr;
    };

  private:
    struct Sleeper;
    struct Self;
    static Self &self();

    [[nodiscard]] bool takes_part() const;
    void cut_pauses();
    void take_part();
    void insert(Sleeper &sleeper);
    [[nodiscard]] bool remove(Sleeper &sleeper);
    void wake(Sleeper &sleeper);
    void suspend_one();
    void advance();
    [[nodiscard]] bool forget_ended(pthread_t thread);
    void remember_ended(pthread_t thread);
    [[nodiscard]] bool hand_to_joiner(pthread_t ending);
    void unlink(const Join &join);

    FutexMutex mutex_;              // guards all below; the atomics are only read without it
    std::atomic<unsigned> run_{0};  // number of the run; odd while the clock runs
    std::atomic<std::int64_t> now_us_{0};
    std::atomic<std::int64_t> epoch_us_{0};
    int running_threads_ = 0;      // threads that take part and neither pause nor wait
    Sleeper *sleepers_ = nullptr;  // in the order of their wake-ups
    Join *joins_ = nullptr;

    // Threads that took part and have ended while nobody joined them: a join of such a one is no
    // wait. The oldest is overwritten; numbers are reused by the system, and taken out then.
    static constexpr std::size_t kEndedThreads = 256;
    std::array<pthread_t, kEndedThreads> ended_{};
    std::size_t next_ended_ = 0;
};

// The clock of the process.
extern VirtualClock virtual_clock;

}  // namespace velkhost::shim
