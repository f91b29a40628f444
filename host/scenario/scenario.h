// The scenario: what the stand-in host has, how each of its services answers in turn, and which
// faults strike. One per process, read from a TOML file; shared by the providers, the job library,
// the shim's hooks and the command line.
#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::scenario {

// A fault strikes at a named step: it lets `after` passes of the step go by, then strikes `count`
// times. `match` narrows the step to those whose subject (a URI, a path, a class name) contains
// it; empty matches all.
struct FaultRule {
    std::string step;
    std::string match;
    int after = 0;
    int count = 1;
    int code = 0;         // errno for a libc step, CIM status for a broker or provider step
    std::string message;  // status message, where the step carries one
};

// What an installation service answers to one call, and what its job reports from then on.
struct ServiceAnswer {
    std::string match;               // URI substring that this answer is for; empty for any
    std::uint32_t return_value = 4096;
    int status = 0;                  // CIM status of the call
    std::string message;
    struct JobLook {
        std::optional<std::string> job_status;  // no value: the property is null
        std::uint16_t job_state = 4;            // DMTF job state: 4 running, 7 completed, ...
        int looks = 1;                          // how many reads in a row see this
        bool absent = false;                    // the job instance cannot be had
    };
    std::vector<JobLook> job;        // the last one holds for ever
};

}  // namespace velkhost::scenario
