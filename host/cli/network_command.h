// `velkhost network`: the table of the in-band network, by the library's own functions.
#pragma once

#include "host/cli/interrupt.h"
#include "host/cli/network_options.h"

namespace velkhost::cli {

// Shows the table; the exit code. Throws when the host cannot be set up.
int run_network(const NetworkOptions &options, Interrupt &interrupt);

}  // namespace velkhost::cli
