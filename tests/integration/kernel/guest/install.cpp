#include "tests/integration/kernel/guest/install.h"

#include "installers/adapter_session.h"
#include "ipmi/kcs_channel.h"
#include "tests/integration/kernel/guest/pauses.h"

#include <algorithm>
#include <filesystem>
#include <future>
#include <memory>
#include <thread>

#include <unistd.h>

namespace velkguest {
namespace {

using velk::adapter::UpdateSession;

constexpr useconds_t kHurryUs = 1'000'000;

void *watch(void *block) {
    return velk::adapter::watch_session(
        block, [](int value) { return velk::adapter::poll_session(value, "watching"); });
}

bool is_channel(const std::filesystem::directory_entry &descriptor) {
    std::error_code gone;
    return std::filesystem::read_symlink(descriptor, gone) == velk::kIpmiDevice;
}

}  // namespace

std::string install(unsigned queries) {
    const UpdateSession session(watch);
    wait_for_pauses(queries);
    const unsigned paused = take_paused_seconds();
    session.close();
    return "watched=" + std::to_string(paused) +
           " closing=" + std::to_string(take_paused_seconds());
}

// A thread that hangs is left behind, with what it works on.
std::string install_in_a_hurry(int limit_s) {
    const auto session = std::make_shared<const UpdateSession>(watch);
    usleep(kHurryUs);
    std::packaged_task<void()> closing([session] { session->close(); });
    const std::future<void> closed = closing.get_future();
    std::thread(std::move(closing)).detach();
    const auto status = closed.wait_for(std::chrono::seconds(limit_s));
    return status == std::future_status::ready ? "closing ended" : "closing hangs";
}

int open_channels() {
    const std::filesystem::directory_iterator all("/proc/self/fd");
    return static_cast<int>(std::count_if(begin(all), end(all), is_channel));
}

}  // namespace velkguest
