#include "host/cli/install_run.h"

#include "host/rig/shim_session.h"
#include "host/rig/text_file.h"

#include <fmt/format.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <ctime>
#include <sstream>
#include <utility>

namespace velkhost::cli {
namespace {

constexpr std::int64_t kMicrosPerSecond = 1'000'000;

// The machine's own time, whatever the host's clock shows: not through libc.
double real_seconds() {
    timespec now{};
    syscall(SYS_clock_gettime, CLOCK_MONOTONIC, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

std::vector<std::string> ids_of(const std::vector<std::string> &locations) {
    std::vector<std::string> ids;
    for (const std::string &location : locations) {
        ids.push_back(rig::package_id(location));
    }
    return ids;
}

std::string status_file_of(const std::string &job_id) {
    return "/tmp/sfcb/velkstat" + job_id + ".txt";
}

}  // namespace

InstallRun::InstallRun(const InstallOptions &options, Interrupt &interrupt, View &view)
    : options_(options),
      interrupt_(interrupt),
      view_(view),
      real_start_(real_seconds()),
      locations_(split_locations(options.uris)),
      rig_({.folder = options.root,
            .scenario_file = options.scenario,
            .virtual_clock = options.virtual_clock},
           interrupt) {
    interrupt_.add([this] { view_.abandon(); });
}

InstallRun::~InstallRun() {
    interrupt_.drop();
}

RunReport InstallRun::execute() {
    fill_request();
    view_.begin(report_.request, ids_of(locations_));
    rig_->history().set_listener([this](const rig::StatusChange &change) {
        view_.change(change.time_us - report_.request.started_us, change.package, change.status);
    });
    const rig::InstallAnswer answer =
        rig_->install({options_.uris, options_.options, options_.update_args});
    report_.answer = {static_cast<int>(answer.status.code), answer.status.message,
                      answer.return_value};
    if (answer.job_id) {
        report_.job = JobReport{*answer.job_id, std::nullopt, {}};
    }
    if (report_.answer.accepted()) {
        follow();
        fill_packages();
    } else {
        report_.host_us = since_start();
    }
    view_.end();
    fill_history();
    if (!report_.limit_reached) {
        rig_->shut_down();
        report_.findings = rig_->findings();
        report_.unfired_faults = rig_->unfired_faults();
    }
    fill_places();
    fill_log();
    report_.real_seconds = real_seconds() - real_start_;
    return std::move(report_);
}

void InstallRun::follow() {
    tick();
    report_.limit_reached = !rig_->wait_until_idle(options_.limit, [this] { tick(); });
    report_.host_us = since_start();
    if (!report_.limit_reached) {
        report_.host_us = rig_->last_activity_us() - report_.request.started_us;
        settle_job();
    }
}

void InstallRun::tick() {
    const std::int64_t now = since_start();
    if (now >= next_look_us_) {
        read_job();
        next_look_us_ = now + rig_->scenario().jobs.poll_seconds * kMicrosPerSecond;
    }
    view_.tick(now, report_.job.value_or(JobReport{}));
}

// The job library looks at the status file now and then: the job shows the end a little later.
void InstallRun::settle_job() {
    const auto entries = rig_->history().entries();
    const std::uint32_t looks = rig_->scenario().jobs.poll_seconds + 1;
    for (std::uint32_t i = 0; i < looks && !entries.empty() && report_.job; ++i) {
        read_job();
        if (rig::parse_status_line(report_.job->status) == entries.back().line) {
            return;
        }
        rig::host_pause_us(kMicrosPerSecond);
    }
    read_job();
}

void InstallRun::read_job() {
    if (!report_.job) {
        return;
    }
    if (const auto view = rig_->job(report_.job->id)) {
        report_.job->state = view->state;
        report_.job->status = view->status;
    }
}

std::int64_t InstallRun::since_start() const {
    return rig::host_now_us() - report_.request.started_us;
}

void InstallRun::fill_request() {
    report_.request = {options_.uris,
                       options_.options.value_or(std::vector<std::uint16_t>{}),
                       options_.update_args,
                       rig_->scenario().source,
                       rig_->scenario().host.node,
                       options_.virtual_clock,
                       rig::host_now_us()};
}

void InstallRun::fill_packages() {
    std::vector<std::optional<std::int64_t>> changed(locations_.size());
    for (const rig::StatusChange &change : rig_->history().changes()) {
        if (change.package < changed.size() && change.status.code != 0) {
            changed[change.package] = change.time_us - report_.request.started_us;
        }
    }
    const auto results = rig_->results();
    for (std::size_t i = 0; i < locations_.size(); ++i) {
        if (i >= kMostPackages) {
            report_.packages.push_back({{rig::package_id(locations_[i]), std::nullopt,
                                         "beyond the packages that a request takes"},
                                        Outcome::kNotTaken,
                                        std::nullopt});
        } else {
            const rig::PackageStatus status =
                i < results.size() ? results[i]
                                   : rig::PackageStatus{rig::package_id(locations_[i]), {}, {}};
            report_.packages.push_back({status, outcome_of(status), changed[i]});
        }
    }
}

void InstallRun::fill_history() {
    for (const rig::StatusChange &change : rig_->history().changes()) {
        report_.history.push_back({change.time_us - report_.request.started_us, change.status});
    }
}

void InstallRun::fill_places() {
    if (!stays()) {
        return;
    }
    const rig::RunFolder &folder = rig_->folder();
    report_.folder = folder.path().string();
    report_.broker_output = folder.inside(kBrokerOutput).string();
    report_.debug_log = folder.inside("/tmp/velkdebug.txt").string();
    if (report_.job) {
        report_.status_file = folder.inside(status_file_of(report_.job->id)).string();
    }
}

void InstallRun::fill_log() {
    if (!options_.log) {
        return;
    }
    std::istringstream text(
        rig::read_text_file(rig_->folder().inside("/tmp/velkdebug.txt")).value_or(""));
    for (std::string line; std::getline(text, line);) {
        report_.log.push_back(line);
    }
}

bool InstallRun::stays() const {
    return !rig_->folder().is_temporary() || !options_.discard;
}

void InstallRun::finish(bool was_shown) {
    if (stays() && was_shown) {
        rig_->folder().keep();
    }
}

void InstallRun::end_process(int code) {
    const auto held = interrupt_.hold();
    if (!stays()) {
        rig::remove_folder(rig_->folder().path());
    }
    _exit(code);
}

}  // namespace velkhost::cli
