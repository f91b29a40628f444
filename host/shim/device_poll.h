// poll on sets of descriptors of which some are open IPMI devices.
#pragma once

#include <poll.h>

#include <optional>
#include <span>

namespace velkhost::shim {

// What poll returns, after waiting in the shim's time; no value when no descriptor is a device.
std::optional<int> poll_devices(std::span<pollfd> set, int timeout_ms);

}  // namespace velkhost::shim
