// What the environment asks of the shim, for the programs that know nothing of it.
#include <algorithm>
#include <array>
#include <charconv>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <optional>
#include <string_view>

#include "host/shim/complain.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

constexpr std::int64_t kMicrosPerSecond = 1'000'000;

void set_root_from(const char *folder) {
    if (folder == nullptr) {
        return;
    }
    if (const int error = velkshim_set_root(folder); error != 0) {
        complain(
            {"VELKSHIM_ROOT=", folder, ": ", strerrordesc_np(error), "; paths stay the machine's"});
    }
}

// Whole seconds, as far as they fit the clock.
std::optional<std::int64_t> parse_epoch_us(std::string_view text) {
    constexpr std::int64_t kLast = std::numeric_limits<std::int64_t>::max() / kMicrosPerSecond;
    std::int64_t seconds = 0;
    const char *const end = text.data() + text.size();
    const auto [rest, error] = std::from_chars(text.data(), end, seconds);
    if (error != std::errc() || rest != end || seconds < 0 || seconds > kLast) {
        return std::nullopt;
    }
    return seconds * kMicrosPerSecond;
}

void start_virtual_clock(const char *epoch) {
    if (epoch == nullptr) {
        velkshim_use_virtual_clock(velkshim_now_us());
        return;
    }
    if (const auto epoch_us = parse_epoch_us(epoch)) {
        velkshim_use_virtual_clock(*epoch_us);
        return;
    }
    complain(
        {"VELKSHIM_EPOCH=", epoch, ": not a number of seconds; the clock stays the machine's"});
}

void set_clock_from(const char *clock, const char *epoch) {
    const std::string_view kind = clock == nullptr ? "real" : clock;
    if (kind == "virtual") {
        start_virtual_clock(epoch);
    } else if (kind != "real") {
        complain({"VELKSHIM_CLOCK=", kind,
                  ": neither \"real\" nor \"virtual\"; the clock stays the machine's"});
    }
}

[[gnu::constructor]] void read_environment() {
    set_root_from(std::getenv("VELKSHIM_ROOT"));
    set_clock_from(std::getenv("VELKSHIM_CLOCK"), std::getenv("VELKSHIM_EPOCH"));
    if (const char *const node = std::getenv("VELKSHIM_NODE"); node != nullptr) {
        velkshim_set_node_name(node);
    }
}

}  // namespace
}  // namespace velkhost::shim
