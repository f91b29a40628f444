// The parts of a scenario that are about the file transfer service.
#pragma once

#include "host/scenario/model.h"
#include "host/scenario/table_reader.h"

namespace velkhost::scenario {

// [file_transfer]
FileTransferSettings read_file_transfer(TableReader in);

// How a fault at the step "filetransfer.fetch" strikes: `action`.
TransferFault read_transfer_action(TableReader &in);

}  // namespace velkhost::scenario
