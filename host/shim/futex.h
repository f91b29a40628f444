// Sleeping and locking straight on the kernel's futex. The shim cannot use pthread locks for its
// own state: a thread sanitizer's interceptors stand in front of them, and the shim also runs on
// threads that the sanitizer does not know yet (new ones) or no more (ending ones).
#pragma once

#include <linux/futex.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <climits>
#include <ctime>

namespace velkhost::shim {

// Sleeps while `word` holds `expected`. Returns 0 after a wake-up, also a stray one, or an errno
// value: EAGAIN (the word had changed), EINTR (a signal handler has run), ETIMEDOUT. A time-out,
// however long, is what makes the call end after a handler that was installed with SA_RESTART.
inline int futex_wait(std::atomic<int> &word, int expected, const timespec *timeout = nullptr) {
    const int saved = errno;
    const long result = syscall(SYS_futex, &word, FUTEX_WAIT_PRIVATE, expected, timeout);
    const int error = result == 0 ? 0 : errno;
    errno = saved;
    return error;
}

inline void futex_wake(std::atomic<int> &word, int count) {
    const int saved = errno;
    syscall(SYS_futex, &word, FUTEX_WAKE_PRIVATE, count);
    errno = saved;
}

// A lock without any set-up or tear-down; fits std::lock_guard.
class FutexMutex {
  public:
    void lock() {
        int seen = kFree;
        if (state_.compare_exchange_strong(seen, kHeld, std::memory_order_acquire)) {
            return;
        }
        while (state_.exchange(kContended, std::memory_order_acquire) != kFree) {
            futex_wait(state_, kContended);
        }
    }

    void unlock() {
        if (state_.exchange(kFree, std::memory_order_release) == kContended) {
            futex_wake(state_, 1);
        }
    }

    // For the child of a fork, whose other threads are gone together with what they held.
    void reset_after_fork() { state_.store(kFree, std::memory_order_relaxed); }

  private:
    static constexpr int kFree = 0;
    static constexpr int kHeld = 1;
    static constexpr int kContended = 2;
    std::atomic<int> state_{kFree};
};

// A word that is set once and for which one thread waits. The setter does not touch it after the
// waiter may have gone on, so that it can live in the waiter's frame.
class Signal {
  public:
    [[nodiscard]] bool is_set() const { return word_.load(std::memory_order_acquire) != 0; }

    void set() {
        word_.store(1, std::memory_order_release);
        futex_wake(word_, 1);  // uses the address alone
    }

    void wait() {
        while (!is_set()) {
            futex_wait(word_, 0);
        }
    }

    // Returns false when a signal handler has run before the word was set.
    [[nodiscard]] bool wait_interruptibly() {
        constexpr timespec kVeryLong{24L * 3600, 0};
        while (!is_set()) {
            if (futex_wait(word_, 0, &kVeryLong) == EINTR) {
                return is_set();
            }
        }
        return true;
    }

  private:
    std::atomic<int> word_{0};
};

}  // namespace velkhost::shim
