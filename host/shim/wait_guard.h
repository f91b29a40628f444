// Scopes for threads that take part in the virtual clock. Both cost two uncontended locks and do
// nothing under the real clock.
#pragma once

#include "host/shim/velkshim.h"

namespace velkhost::shim {

// Around a wait for anything but time: a condition, a socket, the keyboard. Scopes may nest.
//
//     std::unique_lock lock(mutex);
//     const WaitGuard waiting;
//     changed.wait(lock, [&] { return done; });
//
// Between the event and the end of the scope other sleepers may already move the clock on. Where
// the exact time of the event matters, let the thread that causes it note velkshim_now_us().
class WaitGuard {
  public:
    WaitGuard() { velkshim_wait_begin(); }
    ~WaitGuard() { velkshim_wait_end(); }
    WaitGuard(const WaitGuard &) = delete;
    WaitGuard &operator=(const WaitGuard &) = delete;
};

// The calling thread takes part as long as the scope lasts.
class TakePart {
  public:
    TakePart() { velkshim_thread_enter(); }
    ~TakePart() { velkshim_thread_leave(); }
    TakePart(const TakePart &) = delete;
    TakePart &operator=(const TakePart &) = delete;
};

}  // namespace velkhost::shim
