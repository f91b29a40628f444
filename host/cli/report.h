// How a run went, as plain data: what the result table and the JSON document are made of.
#pragma once

#include "host/rig/status_line.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cli {

enum class Outcome {
    kInstalled,     // codes 50, and 59: nothing left to do
    kFailed,        // a final code of failure
    kSkipped,       // never came to a report of its own
    kNotSupported,  // code 80: no installer takes such packages
    kUnfinished,    // still at work when the run ended
    kNotTaken,      // beyond the packages that one request takes
};

Outcome outcome_of(const rig::PackageStatus &status);

// "installed", "failed", "skipped", "not supported", "unfinished", "not taken".
std::string_view outcome_name(Outcome outcome);

// DSP1103, CIM_ConcreteJob.JobState: "Running" for 4; "unknown" for a number without a name.
std::string_view job_state_name(std::uint16_t state);

// All times in microseconds of the host's clock since the request began.
struct PackageReport {
    rig::PackageStatus status;
    Outcome outcome = Outcome::kSkipped;
    std::optional<std::int64_t> changed_us;  // last report; no value: there was none
};

struct HistoryReport {
    std::int64_t at_us = 0;
    rig::PackageStatus status;
};

struct JobReport {
    std::string id;
    std::optional<std::uint16_t> state;
    std::string status;  // JobStatus
};

struct RequestReport {
    std::vector<std::string> uris;
    std::vector<std::uint16_t> options;
    std::optional<std::string> update_args;
    std::string scenario;
    std::string node;
    bool virtual_clock = true;
    std::int64_t started_us = 0;  // since 1970-01-01 UTC
};

// What InstallFromURI answered.
struct AnswerReport {
    int status = 0;  // CIM status
    std::string message;
    std::optional<std::uint32_t> return_value;

    // A job was started.
    [[nodiscard]] bool accepted() const;
    // The synchronous option: success, but no value and nothing installed.
    [[nodiscard]] bool silent() const;
};

struct RunReport {
    RequestReport request;
    AnswerReport answer;
    std::optional<JobReport> job;
    std::vector<PackageReport> packages;
    std::vector<HistoryReport> history;
    std::int64_t host_us = 0;  // how long the request took
    double real_seconds = 0;
    bool limit_reached = false;
    std::string folder;  // empty: it is gone
    std::string debug_log;
    std::string broker_output;  // what the libraries printed
    std::string status_file;
    std::vector<std::string> findings;
    std::vector<std::string> unfired_faults;
    std::vector<std::string> log;  // lines; filled when asked for
};

// Exit codes of `velkhost install`.
enum ExitCode : int {
    kAllInstalled = 0,
    kNotAllInstalled = 1,
    kUsage = 2,
    kRefused = 3,
    kHostTrouble = 4,
};

ExitCode exit_code_of(const RunReport &report);

// "5 of 6 packages installed": what the exit code stands for, in words.
std::string verdict_of(const RunReport &report);

}  // namespace velkhost::cli
