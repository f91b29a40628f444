#include "host/rig/network_component.h"

#include "host/rig/shim_session.h"

#include <fstream>
#include <system_error>
#include <utility>

namespace velkhost::rig {
namespace {

namespace fs = std::filesystem;

constexpr std::int64_t kMicros = 1'000'000;

fs::path inside(const fs::path &root, std::string_view fixed_path) {
    return root / fixed_path.substr(1);
}

}  // namespace

NetworkComponent::NetworkComponent(const fs::path &root, scenario::NetworkSettings settings)
    : flag_(inside(root, kFlag)),
      mapping_(inside(root, "/etc/cim/zeb/nodemapping")),
      settings_(std::move(settings)) {}

NetworkComponent::~NetworkComponent() {
    stop();
}

void NetworkComponent::begin() const {
    std::error_code error;
    if (!fs::exists(mapping_, error)) {
        write_mapping(host_now_us() / kMicros - settings_.age_seconds);
    }
}

void NetworkComponent::notice_flag() noexcept {
    if (!settings_.configure_seconds) {
        return;
    }
    try {
        const std::lock_guard lock(mutex_);
        if (!stopping_) {
            work_.emplace_back(&NetworkComponent::configure, this, *settings_.configure_seconds);
        }
    } catch (const std::exception &) {
        // A component that finds no means to work leaves the flag where it is.
        return;
    }
}

void NetworkComponent::stop() {
    std::list<std::thread> work;
    {
        const std::lock_guard lock(mutex_);
        stopping_ = true;
        work.swap(work_);
    }
    for (std::thread &thread : work) {
        thread.join();
    }
}

// In steps, so that under a real clock nobody waits long for its end.
void NetworkComponent::configure(std::int64_t seconds) const {
    for (; seconds > 0 && !stopping_; --seconds) {
        host_pause_us(kMicros);
    }
    if (stopping_) {
        return;
    }
    write_mapping(host_now_us() / kMicros);
    std::error_code error;
    fs::remove(flag_, error);
}

void NetworkComponent::write_mapping(std::int64_t stamp_s) const {
    if (settings_.nodes.empty()) {
        return;
    }
    std::ofstream file(mapping_);
    file << "RXC IN-Band Network Mappings: " << stamp_s << "\n"
         << "Label Node Device Netmask Hypervisor Controller\n";
    int number = 0;
    for (const scenario::NetworkNode &node : settings_.nodes) {
        file << "node " << number++ << ' ' << node.device << " 255.255.0.0 " << node.hypervisor
             << ' ' << node.controller << '\n';
    }
}

}  // namespace velkhost::rig
