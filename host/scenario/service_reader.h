// The parts of a scenario that are about an installation service.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

#include <vector>

namespace velkhost::scenario {

// A service's table: its `answer`s, in their order. `kind` decides which keys mean something.
std::vector<ServiceAnswer> read_service(TableReader in, ServiceKind kind);

}  // namespace velkhost::scenario
