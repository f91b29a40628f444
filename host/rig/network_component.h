// The host's component for the in-band network, over which the hypervisor reaches the management
// controller of each of its nodes. Who wants the network configured anew puts up the flag
// /tmp/networkflag; the component does so, writes the mapping /etc/cim/zeb/nodemapping, and takes
// the flag away.
#pragma once

#include "host/scenario/model.h"

#include <atomic>
#include <filesystem>
#include <list>
#include <mutex>
#include <string_view>
#include <thread>

namespace velkhost::rig {

class NetworkComponent {
  public:
    static constexpr std::string_view kFlag = "/tmp/networkflag";

    // `root`: where the fixed paths lie.
    NetworkComponent(const std::filesystem::path &root, scenario::NetworkSettings settings);
    ~NetworkComponent();
    NetworkComponent(const NetworkComponent &) = delete;
    NetworkComponent &operator=(const NetworkComponent &) = delete;

    // Writes the mapping as it is when the host begins, unless there is one or it has no nodes.
    void begin() const;

    // The flag has been put up. Never waits or throws.
    void notice_flag() noexcept;

    // Leaves work that is under way undone. The host's clock must still be there.
    void stop();

  private:
    void configure(std::int64_t seconds) const;
    void write_mapping(std::int64_t stamp_s) const;

    const std::filesystem::path flag_;
    const std::filesystem::path mapping_;
    const scenario::NetworkSettings settings_;
    std::atomic<bool> stopping_{false};
    std::mutex mutex_;
    std::list<std::thread> work_;
};

}  // namespace velkhost::rig
