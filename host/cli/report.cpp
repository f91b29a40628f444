#include "host/cli/report.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <utility>

namespace velkhost::cli {
namespace {

// CIM_SoftwareInstallationService: parameters checked, job started.
constexpr std::uint32_t kJobStarted = 4096;

constexpr std::array<std::pair<int, Outcome>, 9> kOutcomes = {{
    {0, Outcome::kSkipped},
    {10, Outcome::kUnfinished},
    {15, Outcome::kUnfinished},
    {50, Outcome::kInstalled},
    {59, Outcome::kInstalled},
    {60, Outcome::kUnfinished},
    {61, Outcome::kUnfinished},
    {62, Outcome::kUnfinished},
    {80, Outcome::kNotSupported},
}};

constexpr std::array<std::pair<std::uint16_t, std::string_view>, 11> kJobStates = {{
    {2, "New"},
    {3, "Starting"},
    {4, "Running"},
    {5, "Suspended"},
    {6, "Shutting Down"},
    {7, "Completed"},
    {8, "Terminated"},
    {9, "Killed"},
    {10, "Exception"},
    {11, "Service"},
    {12, "Query Pending"},
}};

template <class Table, class Key, class Value>
Value looked_up(const Table &table, Key key, Value otherwise) {
    const auto row =
        std::ranges::find_if(table, [key](const auto &entry) { return entry.first == key; });
    return row == table.end() ? otherwise : row->second;
}

std::size_t count_installed(const RunReport &report) {
    return static_cast<std::size_t>(
        std::ranges::count(report.packages, Outcome::kInstalled, &PackageReport::outcome));
}

}  // namespace

Outcome outcome_of(const rig::PackageStatus &status) {
    return status.code ? looked_up(kOutcomes, *status.code, Outcome::kFailed) : Outcome::kSkipped;
}

std::string_view outcome_name(Outcome outcome) {
    switch (outcome) {
        case Outcome::kInstalled:
            return "installed";
        case Outcome::kFailed:
            return "failed";
        case Outcome::kSkipped:
            return "skipped";
        case Outcome::kNotSupported:
            return "not supported";
        case Outcome::kUnfinished:
            return "unfinished";
        case Outcome::kNotTaken:
            return "not taken";
    }
    return "";
}

std::string_view job_state_name(std::uint16_t state) {
    return looked_up(kJobStates, state, std::string_view("unknown"));
}

bool AnswerReport::accepted() const {
    return status == 0 && return_value == kJobStarted;
}

bool AnswerReport::silent() const {
    return status == 0 && !return_value;
}

ExitCode exit_code_of(const RunReport &report) {
    if (!report.findings.empty() || !report.unfired_faults.empty()) {
        return kHostTrouble;
    }
    if (report.answer.silent()) {
        return kNotAllInstalled;
    }
    if (!report.answer.accepted()) {
        return kRefused;
    }
    const bool all = count_installed(report) == report.packages.size();
    return all && !report.packages.empty() && !report.limit_reached ? kAllInstalled
                                                                    : kNotAllInstalled;
}

std::string verdict_of(const RunReport &report) {
    if (report.answer.silent()) {
        return "Nothing was installed: with option 32768 (synchronous installation) the library "
               "reads the package list, installs nothing and sends no return value.";
    }
    if (!report.answer.accepted()) {
        return "The request was refused.";
    }
    const std::size_t total = report.packages.size();
    return fmt::format("{} of {} {} installed", count_installed(report), total,
                       total == 1 ? "package" : "packages");
}

}  // namespace velkhost::cli
