#include "host/cli/lines.h"

#include "host/cli/text.h"

#include <fmt/format.h>

#include <algorithm>

namespace velkhost::cli {

std::size_t widest(const std::vector<std::string> &ids) {
    std::size_t width = 0;
    for (const std::string &id : ids) {
        width = std::max(width, columns(id));
    }
    return width;
}

std::string title_line(const RequestReport &request, std::size_t packages) {
    return fmt::format("{} {} for {}, {} clock, scenario {}", packages,
                       packages == 1 ? "package" : "packages", request.node,
                       request.virtual_clock ? "virtual" : "real", request.scenario);
}

std::string job_line(const JobReport &job) {
    if (!job.state) {
        return "job " + job.id;
    }
    return fmt::format("job {}: {} {}", job.id, *job.state, job_state_name(*job.state));
}

std::string change_line(const Terminal &terminal, std::int64_t at_us, std::size_t id_width,
                        const rig::PackageStatus &status, std::size_t width) {
    const std::string time = fmt::format("[+{}] ", elapsed(at_us));
    const std::string rest =
        fmt::format("{}  {:>2}  {}", padded(printable(status.id, !terminal.utf8), id_width),
                    status.code ? fmt::to_string(*status.code) : "-",
                    printable(status.message, !terminal.utf8));
    const std::size_t room = width > time.size() ? width - time.size() : 0;
    const std::string shown = width == kUnlimited ? rest : cut(rest, room, cut_mark(terminal));
    return paint(terminal, Ink::kDim, time) + paint(terminal, ink_of(status), shown);
}

Ink ink_of(const rig::PackageStatus &status) {
    switch (outcome_of(status)) {
        case Outcome::kInstalled:
            return Ink::kGood;
        case Outcome::kFailed:
            return Ink::kBad;
        case Outcome::kNotSupported:
            return Ink::kWarn;
        case Outcome::kUnfinished:
            return Ink::kBusy;
        case Outcome::kSkipped:
        case Outcome::kNotTaken:
            break;
    }
    return Ink::kDim;
}

std::string symbol_of(const Terminal &terminal, Outcome outcome) {
    switch (outcome) {
        case Outcome::kInstalled:
            return terminal.utf8 ? "✓" : "+";
        case Outcome::kFailed:
            return terminal.utf8 ? "✗" : "x";
        case Outcome::kNotSupported:
            return "!";
        case Outcome::kUnfinished:
            return terminal.utf8 ? "…" : "~";
        case Outcome::kSkipped:
        case Outcome::kNotTaken:
            break;
    }
    return "-";
}

}  // namespace velkhost::cli
