#include "host/providers/management_controller/job_table.h"

#include <algorithm>
#include <utility>

namespace velkhost::providers {

std::string JobTable::start(UpdateRequest request, std::vector<scenario::JobLook> looks) {
    const std::lock_guard lock(mutex_);
    std::string id = "ZEB:SoftwareInstallationJob:" + std::to_string(++started_);
    jobs_.push_back({id, std::move(request), scenario::JobLooks(std::move(looks))});
    if (jobs_.size() > kMostJobs) {
        jobs_.pop_front();
    }
    return id;
}

std::optional<UpdateRequest> JobTable::request_of(const std::string &id) const {
    const std::lock_guard lock(mutex_);
    const auto job = std::ranges::find(jobs_, id, &Job::id);
    return job == jobs_.end() ? std::nullopt : std::optional(job->request);
}

std::optional<JobView> JobTable::take_look(const std::string &id) {
    const std::lock_guard lock(mutex_);
    const auto job = std::ranges::find(jobs_, id, &Job::id);
    if (job == jobs_.end()) {
        return std::nullopt;
    }
    return JobView{job->id, job->request, job->looks.take()};
}

std::vector<JobView> JobTable::peek_all() const {
    const std::lock_guard lock(mutex_);
    std::vector<JobView> views;
    for (const Job &job : jobs_) {
        views.push_back({job.id, job.request, job.looks.peek()});
    }
    return views;
}

}  // namespace velkhost::providers
