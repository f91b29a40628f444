// How a run ended, for programs.
#pragma once

#include "host/cli/report.h"

#include <string>

namespace velkhost::cli {

// One JSON document with a line end. Times are seconds of the host's clock since the request
// began; what is not known is null. Texts that are no UTF-8 have U+FFFD in place of the bad bytes.
std::string json_report(const RunReport &report);

}  // namespace velkhost::cli
