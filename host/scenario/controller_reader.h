// The parts of a scenario that are about the management controller behind the host's IPMI device.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

namespace velkhost::scenario {

// [controller]
ControllerSettings read_controller(TableReader in);

// How a fault at a step "bmc.NAME" strikes: `action`, and the number that goes with it.
void read_controller_fault(TableReader &in, FaultRule &rule);

}  // namespace velkhost::scenario
