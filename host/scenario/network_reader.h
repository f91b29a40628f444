// The part of a scenario that is about the in-band network of the host's nodes.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

namespace velkhost::scenario {

// [network]
NetworkSettings read_network(TableReader in);

}  // namespace velkhost::scenario
