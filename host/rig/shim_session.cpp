#include "host/rig/shim_session.h"

#include "host/rig/rig_error.h"
#include "host/rig/text_file.h"
#include "host/shim/velkshim.h"

#include <array>
#include <cstring>
#include <ctime>
#include <string_view>

namespace velkhost::rig {

ShimSession::ShimSession(const std::filesystem::path &root, scenario::Scenario &scenario,
                         bool virtual_clock, StatusHistory &history)
    : root_(root), scenario_(scenario), history_(history), network_(root, scenario.network) {
    if (const int error = velkshim_set_root(root.c_str()); error != 0) {
        throw RigError("cannot use " + root.string() + " as the host's root: " + strerror(error));
    }
    velkshim_set_node_name(scenario.host.node.c_str());
    if (virtual_clock) {
        velkshim_use_virtual_clock(scenario.host.start_us);
        velkshim_thread_enter();
    } else {
        velkshim_use_real_clock();
    }
    velkshim_set_fault_hook(&ShimSession::strike, this);
    velkshim_observe_files(&ShimSession::note_file, this);
    network_.begin();
}

ShimSession::~ShimSession() {
    velkshim_observe_files(nullptr, nullptr);
    velkshim_set_fault_hook(nullptr, nullptr);
    network_.stop();
    velkshim_thread_leave();
    velkshim_use_real_clock();
    velkshim_set_node_name(nullptr);
    velkshim_set_root(nullptr);
}

int ShimSession::strike(void *session, const char *step) {
    const auto fault = static_cast<ShimSession *>(session)->scenario_.faults.take(step);
    return fault ? fault->code : 0;
}

void ShimSession::note_file(void *session, const char *path, std::int64_t now_us) {
    constexpr std::string_view kLog = "/tmp/velkdebug.txt";
    constexpr std::string_view kStatusFile = "/tmp/sfcb/velkstat";
    auto &self = *static_cast<ShimSession *>(session);
    if (path == kLog) {
        self.last_log_us_.store(now_us);
    }
    if (path == NetworkComponent::kFlag) {
        self.network_.notice_flag();
    }
    if (!std::string_view(path).starts_with(kStatusFile)) {
        return;
    }
    if (const auto text = read_text_file(self.root_.string() + path)) {
        self.history_.add(now_us, path, *text);
    }
}

std::int64_t host_now_us() {
    return velkshim_now_us();
}

void host_pause_us(std::int64_t length_us) {
    constexpr std::int64_t kMicrosPerSecond = 1'000'000;
    const timespec length = {static_cast<time_t>(length_us / kMicrosPerSecond),
                             static_cast<long>(length_us % kMicrosPerSecond * 1000)};
    nanosleep(&length, nullptr);
}

}  // namespace velkhost::rig
