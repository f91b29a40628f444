// The IPMI device of a scenario's host: a controller as described, behind the shim's /dev/ipmi0,
// unless the scenario says that there is none.
#pragma once

#include "host/bmc/controller.h"
#include "host/bmc/ipmi_device.h"
#include "host/scenario/scenario.h"

#include <optional>
#include <vector>

namespace velkhost::bmc {

// One at a time per process.
class ScenarioDevice {
  public:
    // `scenario` must outlive the object.
    explicit ScenarioDevice(scenario::Scenario &scenario);

    // Every exchange so far; none where there is no device.
    [[nodiscard]] std::vector<Exchange> trace() const;

  private:
    std::optional<Controller> controller_;
    std::optional<IpmiDevice> device_;
};

}  // namespace velkhost::bmc
