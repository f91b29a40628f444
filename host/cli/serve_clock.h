// How the host's time goes while clients are served.
#pragma once

#include <cstdint>

namespace velkhost::cli {

// With a virtual clock, time passes only while the thread that made the host pauses; that thread
// gives it out here, in portions. While the host is idle, time goes as fast as the machine's: jobs
// that have ended stay readable for as long as they should. While something is at work, pauses are
// leapt over, and for a while after it, so that the job library sees the end.
class ServeClock {
  public:
    // `speed`: seconds of the virtual clock in one of the machine's, at most.
    ServeClock(bool is_virtual, std::int64_t speed) : virtual_(is_virtual), speed_(speed) {}

    // Lets a little of the machine's time pass, less when a signal comes.
    void tick(bool at_work);

  private:
    const bool virtual_;
    const std::int64_t speed_;
    std::int64_t fast_until_us_ = 0;  // of the host's clock
};

}  // namespace velkhost::cli
