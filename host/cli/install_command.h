// `velkhost install`: one request on a stand-in host of its own.
#pragma once

#include "host/cli/install_options.h"
#include "host/cli/interrupt.h"

namespace velkhost::cli {

// Runs the request and shows it; the exit code. When the request was still at work at its limit,
// this ends the process instead of returning, since nothing can be taken from under its threads.
int run_install(const InstallOptions &options, Interrupt &interrupt);

}  // namespace velkhost::cli
