// What `velkhost network` found, as data, for people and for programs.
#pragma once

#include "host/rig/network_calls.h"

#include <cstdint>
#include <optional>
#include <string>

namespace velkhost::cli {

// How the network was configured anew.
struct ConfigureReport {
    bool done;             // or not needed; false: nobody did so in time
    std::int64_t took_us;  // of the host's time; 0 when it was not needed
};

struct NetworkReport {
    std::string node;  // the host's name
    std::string scenario;
    std::optional<ConfigureReport> configure;  // no value: not asked for
    std::optional<rig::NetworkTable> table;
    std::string trouble;  // why there is no table, in the library's words
    std::int64_t now_us = 0;
};

int exit_code_of(const NetworkReport &report);

std::string network_text(const NetworkReport &report);
std::string network_json(const NetworkReport &report);

}  // namespace velkhost::cli
