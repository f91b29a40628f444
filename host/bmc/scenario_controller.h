// The controller that a scenario describes.
#pragma once

#include "host/bmc/controller.h"
#include "host/scenario/scenario.h"

namespace velkhost::bmc {

Settings settings_of(const scenario::Scenario &scenario);

// `scenario` must outlive what asks it.
FaultSource faults_of(scenario::Scenario &scenario);

}  // namespace velkhost::bmc
