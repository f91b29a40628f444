// Reads a scenario from TOML. Strict: an unknown key, a wrong type or a value out of range is a
// ScenarioError that reads "file:line: message". scenarios/README.md lists every key.
#pragma once

#include "host/scenario/model.h"

#include <string>
#include <string_view>

namespace velkhost::scenario {

// `source` is the name that messages and Description::source bear.
VELKSCENARIO_API Description parse_description(std::string_view text, const std::string &source);

// Reads the file; one that cannot be read is an error without a line, "file: message".
VELKSCENARIO_API Description read_description(const std::string &path);

// The same, but a file that is not there is the built-in default.
VELKSCENARIO_API Description read_description_if_there(const std::string &path);

}  // namespace velkhost::scenario
