// The control calls of the IPMI device (<linux/ipmi.h>), each with the request codes and structs of
// the ABI that it is built for.
#pragma once

#include <memory>

#include "host/shim/device_opens.h"

namespace velkhost::shim {

// Serves a control call on an open device. Returns 0 or an errno value.
int control_device(const DeviceAccess &access, const std::shared_ptr<IpmiClient> &client,
                   unsigned long code, void *argument);

}  // namespace velkhost::shim
