// Puts a controller behind the shim's /dev/ipmi0.
#pragma once

#include "host/bmc/controller.h"

namespace velkhost::bmc {

// The host has the device as long as this object lives. One at a time per process.
class IpmiDevice {
  public:
    // `controller` must outlive the object.
    explicit IpmiDevice(Controller &controller);
    ~IpmiDevice();
    IpmiDevice(const IpmiDevice &) = delete;
    IpmiDevice &operator=(const IpmiDevice &) = delete;
};

}  // namespace velkhost::bmc
