// How a run ended, for people.
#pragma once

#include "host/cli/report.h"
#include "host/cli/terminal.h"

#include <cstddef>
#include <string>

namespace velkhost::cli {

// A line per package, then job, times, places and findings, and the verdict. Messages of packages
// are cut so that a line has at most `width` columns; kUnlimited for none.
std::string result_table(const RunReport &report, const Terminal &terminal, std::size_t width);

}  // namespace velkhost::cli
