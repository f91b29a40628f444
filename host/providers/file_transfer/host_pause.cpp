#include "host/providers/file_transfer/host_pause.h"

#include <algorithm>
#include <ctime>

namespace velkhost::providers {
namespace {

constexpr std::int64_t kMicrosPerSecond = 1'000'000;

void pause_once(std::int64_t micros) {
    const timespec length = {static_cast<time_t>(micros / kMicrosPerSecond),
                             static_cast<long>(micros % kMicrosPerSecond * 1000)};
    ::nanosleep(&length, nullptr);
}

}  // namespace

void host_pause(std::int64_t micros, const std::stop_token &stop) {
    while (micros > 0 && !stop.stop_requested()) {
        const std::int64_t part = std::min(micros, kMicrosPerSecond);
        pause_once(part);
        micros -= part;
    }
}

void take_part_in_host_time() {
    pause_once(0);
}

}  // namespace velkhost::providers
