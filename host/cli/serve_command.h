// `velkhost serve`: a whole host that WBEM clients can call.
#pragma once

#include "host/cli/serve_options.h"

namespace velkhost::cli {

// Serves until a signal comes; the exit code. Throws UsageError for options that do not go
// together.
int run_serve(const ServeOptions &options);

}  // namespace velkhost::cli
