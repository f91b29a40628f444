// A closed loop of requests, measured.
#pragma once

#include "bench/messages.h"

#include <cstddef>
#include <cstdint>
#include <string>

namespace velkbench {

struct Figures {
    std::size_t connections = 0;
    std::uint64_t answers = 0;
    std::uint64_t errors = 0;  // answers that were none, or CIM errors
    std::string first_error;
    double per_second = 0;
    double median_ms = 0;
    double percentile99_ms = 0;
};

// Sends the message on that many connections at once, again and again, for the given time.
Figures measure(const Options &options, const Message &message, std::size_t connections);

}  // namespace velkbench
