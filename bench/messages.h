// The requests of the benchmark, ready to be sent.
#pragma once

#include "bench/options.h"

#include <string>
#include <vector>

namespace velkbench {

struct Message {
    std::string name;   // of the operation
    std::string bytes;  // of the whole HTTP request
};

std::string enumerate_instance_names(const Options &options);

// EnumerateInstances, GetInstance and the method; `instance_name` is an INSTANCENAME element.
std::vector<Message> load_messages(const Options &options, const std::string &instance_name);

}  // namespace velkbench
