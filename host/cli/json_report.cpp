#include "host/cli/json_report.h"

#include "host/cli/text.h"

#include <nlohmann/json.hpp>

namespace velkhost::cli {
namespace {

// Keys stay in the order in which a reader wants them.
using Json = nlohmann::ordered_json;

double seconds(std::int64_t us) {
    return static_cast<double>(us) / 1e6;
}

template <class T>
Json nullable(const std::optional<T> &value) {
    return value ? Json(*value) : Json();
}

Json nullable(const std::string &text) {
    return text.empty() ? Json() : Json(text);
}

Json of_request(const RequestReport &request) {
    return {{"uris", request.uris},
            {"options", request.options},
            {"update_args", nullable(request.update_args)},
            {"scenario", request.scenario},
            {"node", request.node},
            {"clock", request.virtual_clock ? "virtual" : "real"},
            {"started", iso_time(request.started_us)}};
}

Json of_answer(const AnswerReport &answer) {
    return {{"status", answer.status},
            {"message", answer.message},
            {"return_value", nullable(answer.return_value)},
            {"accepted", answer.accepted()}};
}

Json of_job(const std::optional<JobReport> &job) {
    if (!job) {
        return {};
    }
    return {{"id", job->id},
            {"state", nullable(job->state)},
            {"state_name", job->state ? Json(job_state_name(*job->state)) : Json()},
            {"status", job->status}};
}

Json of_packages(const std::vector<PackageReport> &packages) {
    Json list = Json::array();
    for (const PackageReport &package : packages) {
        list.push_back({{"id", package.status.id},
                        {"outcome", outcome_name(package.outcome)},
                        {"code", nullable(package.status.code)},
                        {"message", package.status.message},
                        {"at", package.changed_us ? Json(seconds(*package.changed_us)) : Json()}});
    }
    return list;
}

Json of_history(const std::vector<HistoryReport> &history) {
    Json list = Json::array();
    for (const HistoryReport &entry : history) {
        list.push_back({{"at", seconds(entry.at_us)},
                        {"package", entry.status.id},
                        {"code", nullable(entry.status.code)},
                        {"message", entry.status.message}});
    }
    return list;
}

Json of_files(const RunReport &report) {
    return {{"folder", nullable(report.folder)},
            {"debug_log", nullable(report.debug_log)},
            {"broker_output", nullable(report.broker_output)},
            {"status_file", nullable(report.status_file)}};
}

}  // namespace

std::string json_report(const RunReport &report) {
    Json document = {{"request", of_request(report.request)},
                     {"answer", of_answer(report.answer)},
                     {"job", of_job(report.job)},
                     {"packages", of_packages(report.packages)},
                     {"history", of_history(report.history)},
                     {"host_seconds", seconds(report.host_us)},
                     {"real_seconds", report.real_seconds},
                     {"limit_reached", report.limit_reached},
                     {"files", of_files(report)},
                     {"findings", report.findings},
                     {"unfired_faults", report.unfired_faults},
                     {"verdict", verdict_of(report)},
                     {"exit_code", static_cast<int>(exit_code_of(report))}};
    if (!report.log.empty()) {
        document["log"] = report.log;
    }
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace velkhost::cli
