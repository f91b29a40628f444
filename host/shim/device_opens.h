// The open IPMI devices of the process, by descriptor, and the driver behind them.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>

#include "host/shim/device_driver.h"
#include "host/shim/futex.h"

namespace velkhost::shim {

class Rerooted;

// Whether any descriptor may be one of the device's; costs one load.
bool device_is_open();

// One thread's use of the driver and the table: construction takes the lock, and what the driver
// has to do by now is done.
class DeviceAccess {
  public:
    DeviceAccess();
    ~DeviceAccess();
    DeviceAccess(const DeviceAccess &) = delete;
    DeviceAccess &operator=(const DeviceAccess &) = delete;

    // The client behind the descriptor; null for any other descriptor.
    [[nodiscard]] std::shared_ptr<IpmiClient> client(int descriptor) const;

    [[nodiscard]] IpmiDriver &driver() const;
    [[nodiscard]] std::int64_t now_us() const { return now_us_; }

  private:
    std::int64_t now_us_;
};

// Opens the device where `target` is its path and a controller was set: a descriptor, or -1 with
// errno. No value in every other case.
std::optional<int> open_device(const Rerooted &target, int flags);

// The descriptor is about to be closed, or stands for something else from here on.
void forget_device(int descriptor);

// `copy` stands for the same open as `descriptor` from here on.
void copy_device(int descriptor, int copy);

}  // namespace velkhost::shim
