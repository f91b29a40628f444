// The parts of a scenario that are about adapters and the services of their vendors.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

namespace velkhost::scenario {

// [[adapter]], and the answers of each family: [[emulex_fc.answer]], [[qlogic.answer]], ...
void read_adapters(TableReader &root, Description &out);

}  // namespace velkhost::scenario
