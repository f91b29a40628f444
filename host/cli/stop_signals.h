// Signals that ask a command to come to its end in good order.
#pragma once

#include <csignal>

namespace velkhost::cli {

// SIGINT, SIGTERM and SIGHUP are counted as long as it lives. They are blocked at first, also in
// threads that are made meanwhile, which is what keeps them from those; `unblock` lets them reach
// the calling thread, whose pauses they cut short. There is one at a time.
class StopSignals {
  public:
    StopSignals();
    ~StopSignals();
    StopSignals(const StopSignals &) = delete;
    StopSignals &operator=(const StopSignals &) = delete;

    void unblock() const;

    // How many came.
    [[nodiscard]] static int count();
    // The first one; 0 before.
    [[nodiscard]] static int first();

  private:
    sigset_t signals_{};
    sigset_t mask_before_{};
};

}  // namespace velkhost::cli
