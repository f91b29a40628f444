#include "host/bmc/scenario_device.h"

#include "host/bmc/scenario_controller.h"

namespace velkhost::bmc {

ScenarioDevice::ScenarioDevice(scenario::Scenario &scenario) {
    if (scenario.controller.present) {
        controller_.emplace(settings_of(scenario), faults_of(scenario));
        device_.emplace(*controller_);
    }
}

std::vector<Exchange> ScenarioDevice::trace() const {
    return controller_ ? controller_->trace() : std::vector<Exchange>();
}

}  // namespace velkhost::bmc
