#include "host/scenario/service_reader.h"

#include <utility>

namespace velkhost::scenario {
namespace {

constexpr std::uint32_t kHighestUint32 = 0xFFFFFFFF;
constexpr std::uint32_t kHighestUint16 = 0xFFFF;
constexpr std::uint32_t kHighestCimStatus = 200;
constexpr std::uint32_t kWholePercent = 100;

JobLook read_look(TableReader in, ServiceKind kind) {
    JobLook look;
    look.job_state = kind == ServiceKind::kStatus ? kUpdateRunning : kJobRunning;
    if (kind == ServiceKind::kJob) {
        look.job_status = in.text("status");
    }
    assign(look.job_state, in.number("state", 0, kHighestUint16));
    assign(look.looks, in.number("looks", 1, kMostTurns));
    assign(look.absent, in.flag("absent"));
    if (kind == ServiceKind::kJob) {
        if (const auto percent = in.number("percent", 0, kWholePercent)) {
            look.percent = static_cast<std::uint16_t>(*percent);
        }
    }
    if (look.absent && look.job_status) {
        in.fail("status", "cannot be seen while the job is absent");
    }
    in.finish();
    return look;
}

std::optional<std::vector<JobLook>> read_job(TableReader &in, ServiceKind kind) {
    if (kind == ServiceKind::kAtOnce) {
        return std::nullopt;
    }
    auto tables = in.tables("job");
    if (!tables) {
        return std::nullopt;
    }
    std::vector<JobLook> looks;
    for (TableReader &table : *tables) {
        looks.push_back(read_look(std::move(table), kind));
    }
    return looks;
}

ServiceAnswer read_answer(TableReader in, ServiceKind kind) {
    ServiceAnswer answer;
    answer.return_value = usual_return_value(kind);
    assign(answer.match, in.text("match"));
    assign(answer.return_value, in.number("return_value", 0, kHighestUint32));
    assign(answer.status, in.number("status", 0, kHighestCimStatus));
    assign(answer.message, in.text("message"));
    answer.job = read_job(in, kind);
    if (answer.status == 0 && !answer.message.empty()) {
        in.fail("message", "needs a status other than 0 to go with");
    }
    const bool started = answer.status == 0 && answer.return_value == kJobStarted;
    if (!started && answer.job) {
        in.fail("job", "needs status 0 and return_value 4096: otherwise no job starts");
    }
    in.finish();
    return answer;
}

}  // namespace

std::vector<ServiceAnswer> read_service(TableReader in, ServiceKind kind) {
    std::vector<ServiceAnswer> answers;
    if (auto tables = in.tables("answer")) {
        for (TableReader &table : *tables) {
            answers.push_back(read_answer(std::move(table), kind));
        }
    }
    in.finish();
    return answers;
}

}  // namespace velkhost::scenario
