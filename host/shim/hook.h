// One callback with its context, replaceable while other threads call it.
#pragma once

#include <sched.h>

#include <atomic>
#include <mutex>
#include <utility>

#include "host/shim/futex.h"

// Present where the process runs under the thread sanitizer, null elsewhere. The shim is built
// without instrumentation, so it states itself what its hooks hand from thread to thread: from the
// setter to the callbacks, and from the callbacks to the setter that replaces them; but nothing
// from one callback to the next, where the sanitizer shall find what the callbacks do not guard.
extern "C" {
// NOLINTBEGIN(bugprone-reserved-identifier): the sanitizer's own names
[[gnu::weak]] void __tsan_acquire(void *address);
[[gnu::weak]] void __tsan_release(void *address);
// NOLINTEND(bugprone-reserved-identifier)
}

namespace velkhost::shim {

inline void state_acquire(void *address) {
    if (__tsan_acquire != nullptr) {
        __tsan_acquire(address);
    }
}

inline void state_release(void *address) {
    if (__tsan_release != nullptr) {
        __tsan_release(address);
    }
}

// How many callbacks the calling thread is in. Calls that a callback makes call no callback.
inline thread_local int callback_depth = 0;

template <typename Function>
class Hook {
  public:
    // When this returns, no thread is in the former callback any more (unless a callback sets).
    void set(Function *function, void *context) {
        const std::lock_guard lock(setting_);
        function_.store(nullptr);
        while (callback_depth == 0 && callers_.load() != 0) {
            sched_yield();
        }
        state_acquire(&callers_);
        state_release(&context_);
        context_.store(context);
        function_.store(function);
    }

    [[nodiscard]] bool is_set() const { return callback_depth == 0 && function_.load() != nullptr; }

    // What the callback returns, or a value-initialised result where none is set.
    template <typename... Args>
    auto operator()(Args... args) {
        const Visit visit(*this);
        using Result = decltype(std::declval<Function *>()(nullptr, args...));
        Function *const function = callback_depth > 1 ? nullptr : function_.load();
        if (function == nullptr) {
            return Result();
        }
        state_acquire(&context_);
        return function(context_.load(), args...);
    }

  private:
    class Visit {
      public:
        explicit Visit(Hook &hook) : hook_(hook) {
            hook_.callers_.fetch_add(1);
            ++callback_depth;
        }
        Visit(const Visit &) = delete;
        Visit &operator=(const Visit &) = delete;
        ~Visit() {
            state_release(&hook_.callers_);
            --callback_depth;
            hook_.callers_.fetch_sub(1);
        }

      private:
        Hook &hook_;
    };

    FutexMutex setting_;
    std::atomic<int> callers_{0};
    std::atomic<void *> context_{nullptr};
    std::atomic<Function *> function_{nullptr};
};

}  // namespace velkhost::shim
