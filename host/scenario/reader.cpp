#include "host/scenario/reader.h"

#include "host/scenario/adapter_reader.h"
#include "host/scenario/controller_reader.h"
#include "host/scenario/fault_steps.h"
#include "host/scenario/hypervisor_reader.h"
#include "host/scenario/network_reader.h"
#include "host/scenario/read_file.h"
#include "host/scenario/service_reader.h"
#include "host/scenario/table_reader.h"
#include "host/scenario/transfer_reader.h"

#include <cerrno>
#include <cstring>
#include <utility>

namespace velkhost::scenario {
namespace {

constexpr std::uint32_t kHighestCimStatus = 200;
constexpr std::uint32_t kHighestErrno = 4095;
constexpr std::size_t kLongestNode = 64;

HostSettings read_host(TableReader in) {
    HostSettings host;
    assign(host.node, in.text("node"));
    if (host.node.empty() || host.node.size() > kLongestNode) {
        in.fail("node", "must be 1 to 64 bytes long");
    }
    assign(host.start_us, in.instant_us("start"));
    if (host.start_us < 0) {
        in.fail("start", "must not lie before 1970");
    }
    in.finish();
    return host;
}

JobSettings read_jobs(TableReader in) {
    JobSettings jobs;
    assign(jobs.poll_seconds, in.number("poll_seconds", 1, 3600));
    assign(jobs.first_number, in.number("first_number", 1, 1'000'000'000));
    in.finish();
    return jobs;
}

int read_errno(TableReader &in) {
    const Node *node = in.any("code");
    if (node == nullptr) {
        in.fail("code", "is missing: the errno, by number or name");
    }
    const auto *name = std::get_if<std::string>(&node->value);
    if (name == nullptr) {
        return static_cast<int>(*in.number("code", 1, kHighestErrno));
    }
    const auto number = errno_by_name(*name);
    if (!number) {
        in.fail("code", "is no errno name: \"" + *name + '"');
    }
    return *number;
}

int read_code(TableReader &in, CodeKind kind) {
    if (kind == CodeKind::kErrno) {
        return read_errno(in);
    }
    const auto status = in.number("code", 1, kHighestCimStatus);
    if (!status) {
        in.fail("code", "is missing: the CIM status, 1 to 200");
    }
    return static_cast<int>(*status);
}

std::uint32_t read_count(TableReader &in) {
    const Node *node = in.any("count");
    const auto *word = node == nullptr ? nullptr : std::get_if<std::string>(&node->value);
    if (word == nullptr) {
        return in.number("count", 1, kMostTurns).value_or(1);
    }
    if (*word != "always") {
        in.fail("count", "must be a whole number or \"always\"");
    }
    return FaultRule::kAlways;
}

FaultRule read_fault(TableReader in) {
    FaultRule rule;
    rule.line = in.line();
    const auto step = in.text("step");
    const auto kind = step ? step_code_kind(*step) : std::nullopt;
    if (!kind) {
        in.fail("step", (step ? "is none that is served; served are " : "is missing; served are ") +
                            known_steps());
    }
    rule.step = *step;
    assign(rule.match, in.text("match"));
    assign(rule.after, in.number("after", 0, kMostTurns));
    rule.count = read_count(in);
    if (*kind == CodeKind::kController) {
        read_controller_fault(in, rule);
        in.finish();
        return rule;
    }
    if (*kind == CodeKind::kTransfer) {
        rule.transfer = read_transfer_action(in);
        in.finish();
        return rule;
    }
    rule.code = read_code(in, *kind);
    assign(rule.message, in.text("message"));
    if (*kind == CodeKind::kErrno && !(rule.message.empty() && rule.match.empty())) {
        in.fail(rule.message.empty() ? "match" : "message",
                "means nothing to a step of libc; its name says all");
    }
    in.finish();
    return rule;
}

// What reading came to when read_file had no text.
Description fail_unreadable(const std::string &path) {
    throw ScenarioError(path + ": " + std::strerror(errno));
}

}  // namespace

Description parse_description(std::string_view text, const std::string &source) {
    const Node root = parse_document(text, source);
    TableReader in(root, "", source);
    Description out;
    out.source = source;
    if (auto table = in.table("host")) {
        out.host = read_host(*std::move(table));
    }
    if (auto table = in.table("jobs")) {
        out.jobs = read_jobs(*std::move(table));
    }
    if (auto table = in.table("controller")) {
        out.controller = read_controller(*std::move(table));
    }
    if (auto table = in.table("management_controller")) {
        out.management_controller = read_service(*std::move(table), ServiceKind::kJob);
    }
    if (auto table = in.table("hypervisor")) {
        out.hypervisor = read_hypervisor(*std::move(table));
    }
    if (auto table = in.table("network")) {
        out.network = read_network(*std::move(table));
    }
    read_adapters(in, out);
    if (auto table = in.table("file_transfer")) {
        out.file_transfer = read_file_transfer(*std::move(table));
    }
    if (auto tables = in.tables("fault")) {
        for (TableReader &table : *tables) {
            out.faults.push_back(read_fault(std::move(table)));
        }
    }
    in.finish();
    return out;
}

Description read_description(const std::string &path) {
    const auto text = read_file(path);
    return text ? parse_description(*text, path) : fail_unreadable(path);
}

Description read_description_if_there(const std::string &path) {
    const auto text = read_file(path);
    if (!text && (errno == ENOENT || errno == ENOTDIR)) {
        return {};
    }
    return text ? parse_description(*text, path) : fail_unreadable(path);
}

}  // namespace velkhost::scenario
