// The process's libc calls as this host's: its root, clock, node name, faults and file observer,
// and with the observer the host's network component.
#pragma once

#include "host/rig/network_component.h"
#include "host/rig/status_history.h"
#include "host/scenario/scenario.h"

#include <atomic>
#include <cstdint>
#include <filesystem>
#include <string>

namespace velkhost::rig {

// Set up by the constructor and undone by the destructor. Under the virtual clock the thread that
// makes it takes part: time passes while that thread pauses, and only then.
class ShimSession {
  public:
    // Both references must outlive the session. Throws RigError.
    ShimSession(const std::filesystem::path &root, scenario::Scenario &scenario, bool virtual_clock,
                StatusHistory &history);
    ~ShimSession();
    ShimSession(const ShimSession &) = delete;
    ShimSession &operator=(const ShimSession &) = delete;

    // When the library last wrote to its debug log; 0 before the first time.
    [[nodiscard]] std::int64_t last_log_us() const { return last_log_us_.load(); }

  private:
    static int strike(void *session, const char *step);
    static void note_file(void *session, const char *path, std::int64_t now_us);

    const std::filesystem::path root_;
    scenario::Scenario &scenario_;
    StatusHistory &history_;
    std::atomic<std::int64_t> last_log_us_{0};
    NetworkComponent network_;
};

// Time of the host's clock, microseconds since 1970-01-01 UTC.
std::int64_t host_now_us();

// A pause on the host's clock.
void host_pause_us(std::int64_t length_us);

}  // namespace velkhost::rig
