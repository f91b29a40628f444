#include "host/cli/serve_clock.h"

#include "host/rig/shim_session.h"

#include <poll.h>

namespace velkhost::cli {

void ServeClock::tick(bool at_work) {
    constexpr int kTickMs = 10;
    constexpr std::int64_t kTickUs = kTickMs * 1000;
    // The job library looks at a job's state every ten seconds.
    constexpr std::int64_t kAfterWorkUs = 60'000'000;
    // The machine's time: no pause of the host's clock.
    poll(nullptr, 0, kTickMs);
    if (!virtual_) {
        return;
    }
    if (at_work) {
        fast_until_us_ = rig::host_now_us() + kAfterWorkUs;
    }
    const bool fast = at_work || rig::host_now_us() < fast_until_us_;
    rig::host_pause_us(kTickUs * (fast ? speed_ : 1));
}

}  // namespace velkhost::cli
