// The part of a scenario that is about the hypervisor.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

namespace velkhost::scenario {

// [hypervisor]
HypervisorSettings read_hypervisor(TableReader in);

}  // namespace velkhost::scenario
