// Threads as reports name them, and waits that a stopped clock must know of.
#pragma once

#include <functional>

namespace velkhost::broker {

// Small number of the calling thread, in order of its first call; never used twice.
unsigned thread_number();

// Around a wait for another thread: where the process has the clock shim, a virtual clock does not
// count the calling thread as busy in between.
class WaitGuard {
  public:
    WaitGuard();
    ~WaitGuard();
    WaitGuard(const WaitGuard &) = delete;
    WaitGuard &operator=(const WaitGuard &) = delete;
};

// Runs `work` on a thread of its own and waits for its end.
void run_on_fresh_thread(const std::function<void()> &work);

}  // namespace velkhost::broker
