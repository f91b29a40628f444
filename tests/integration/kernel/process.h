// A program run for what it prints.
#pragma once

#include <chrono>
#include <string>
#include <vector>

namespace velkkernel {

// Whether the search path has it.
bool is_program(const std::string &name);

// Its standard output and error up to its end. A program that is still there after `limit` is
// killed, and std::runtime_error tells what it had printed.
std::string output_of(const std::vector<std::string> &command, std::chrono::seconds limit);

}  // namespace velkkernel
