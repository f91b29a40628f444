#include "host/cli/result_table.h"

#include "host/cli/lines.h"
#include "host/cli/text.h"

#include <fmt/format.h>

#include <algorithm>

namespace velkhost::cli {
namespace {

class Table {
  public:
    Table(const RunReport &report, const Terminal &terminal, std::size_t width)
        : report_(report), terminal_(terminal), width_(width) {}

    std::string text() {
        if (report_.answer.accepted()) {
            add_packages();
        } else if (!report_.answer.silent()) {
            add_refusal();
        }
        add_places();
        add_troubles();
        add_verdict();
        return std::move(text_);
    }

  private:
    void add_packages();
    void add_package(const PackageReport &package, std::size_t id_width);
    void add_refusal();
    void add_places();
    void add_troubles();
    void add_verdict();
    void add_fact(std::string_view name, const std::string &value, Ink ink = Ink::kPlain);

    [[nodiscard]] std::string shown(std::string_view text) const {
        return printable(text, !terminal_.utf8);
    }

    const RunReport &report_;
    const Terminal &terminal_;
    const std::size_t width_;
    std::string text_;
};

constexpr std::string_view kRowFormat = "{} {}  {}  {:>4}  {}  {}";

Ink ink_of(Outcome outcome) {
    switch (outcome) {
        case Outcome::kInstalled:
            return Ink::kGood;
        case Outcome::kFailed:
        case Outcome::kUnfinished:
        case Outcome::kNotTaken:
            return Ink::kBad;
        case Outcome::kSkipped:
        case Outcome::kNotSupported:
            break;
    }
    return Ink::kWarn;
}

// To the second: runs of a scenario shall read the same.
std::string rounded(double seconds) {
    return seconds < 1 ? "less than a second" : fmt::format("{:.0f} s", seconds);
}

constexpr std::size_t kOutcomeWidth = 13;
constexpr std::size_t kTimeWidth = 9;

void Table::add_packages() {
    std::vector<std::string> ids = {"package"};
    for (const PackageReport &package : report_.packages) {
        ids.push_back(shown(package.status.id));
    }
    const std::size_t id_width = widest(ids);
    const std::string head =
        fmt::format(kRowFormat, " ", padded("package", id_width), padded("outcome", kOutcomeWidth),
                    "code", padded("when", kTimeWidth), "message");
    text_ += paint(terminal_, Ink::kDim, cut(head, width_, cut_mark(terminal_))) + "\n";
    for (const PackageReport &package : report_.packages) {
        add_package(package, id_width);
    }
}

void Table::add_package(const PackageReport &package, std::size_t id_width) {
    const auto &[status, outcome, changed_us] = package;
    const std::string line = fmt::format(
        kRowFormat, symbol_of(terminal_, outcome), padded(shown(status.id), id_width),
        padded(outcome_name(outcome), kOutcomeWidth),
        status.code ? fmt::to_string(*status.code) : "-",
        padded(changed_us ? "+" + elapsed(*changed_us) : "-", kTimeWidth), shown(status.message));
    text_ += paint(terminal_, ink_of(outcome), cut(line, width_, cut_mark(terminal_))) + "\n";
}

void Table::add_refusal() {
    const AnswerReport &answer = report_.answer;
    add_fact("CIM status", fmt::format("{} {}", answer.status, shown(answer.message)));
    add_fact("return value", answer.return_value ? fmt::to_string(*answer.return_value) : "none");
}

void Table::add_places() {
    text_ += "\n";
    if (report_.job) {
        add_fact("job", job_line(*report_.job).substr(sizeof("job ") - 1));
    }
    add_fact("time",
             fmt::format("{} on the host's {} clock, {} of real time", elapsed(report_.host_us),
                         report_.request.virtual_clock ? "virtual" : "real",
                         rounded(report_.real_seconds)));
    if (report_.folder.empty()) {
        return;
    }
    add_fact("debug log", shown(report_.debug_log));
    if (!report_.status_file.empty()) {
        add_fact("status file", shown(report_.status_file));
    }
    add_fact("run folder", shown(report_.folder));
}

void Table::add_troubles() {
    for (const std::string &finding : report_.findings) {
        add_fact("broker finding", shown(finding), Ink::kBad);
    }
    for (const std::string &rule : report_.unfired_faults) {
        add_fact("fault not met", shown(rule), Ink::kBad);
    }
    if (report_.limit_reached) {
        add_fact("limit reached",
                 fmt::format("the request was still at work after {}", elapsed(report_.host_us)),
                 Ink::kBad);
    }
}

void Table::add_verdict() {
    const bool good = exit_code_of(report_) == kAllInstalled;
    text_ += "\n" + paint(terminal_, good ? Ink::kGood : Ink::kBad, verdict_of(report_)) + "\n";
}

void Table::add_fact(std::string_view name, const std::string &value, Ink ink) {
    constexpr std::size_t kNameWidth = 16;
    text_ +=
        paint(terminal_, Ink::kDim, padded(name, kNameWidth)) + paint(terminal_, ink, value) + "\n";
}

}  // namespace

std::string result_table(const RunReport &report, const Terminal &terminal, std::size_t width) {
    return Table(report, terminal, width).text();
}

}  // namespace velkhost::cli
