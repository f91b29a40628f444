// How far a job is, read from its status line.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace velkhost::jobs {

// The share of packages with a final code, in percent and rounded down. The line is a number and
// "|", then per package its name, a code and a text with ": " between them and "|" behind; what is
// cut off at the end does not count. No value for a line without a package.
std::optional<std::uint16_t> percent_complete(std::string_view line);

}  // namespace velkhost::jobs
