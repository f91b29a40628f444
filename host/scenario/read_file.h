// A whole file as text, read with the plain calls that a file-system shim serves.
#pragma once

#include "host/scenario/model.h"

#include <optional>
#include <string>

namespace velkhost::scenario {

// No value when the file cannot be read; errno says why.
VELKSCENARIO_API std::optional<std::string> read_file(const std::string &path);

}  // namespace velkhost::scenario
