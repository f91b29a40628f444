#include "host/providers/kit/job_table.h"

#include <algorithm>
#include <utility>

namespace velkhost::providers {
namespace {

// The organisation comes first and is set off by a colon (InstanceID, DSP1103): the class
// ZEB_SoftwareInstallationJob has jobs "ZEB:SoftwareInstallationJob:1" and so on.
std::string id_of(std::string job_class, std::uint32_t number) {
    if (const auto mark = job_class.find('_'); mark != std::string::npos) {
        job_class[mark] = ':';
    }
    return job_class + ':' + std::to_string(number);
}

}  // namespace

std::string JobTable::start(const std::string &job_class, JobRequest request,
                            std::vector<scenario::JobLook> looks) {
    const std::lock_guard lock(mutex_);
    std::string id = id_of(job_class, ++started_);
    jobs_.push_back({id, std::move(request), scenario::JobLooks(std::move(looks))});
    if (jobs_.size() > kMostJobs) {
        jobs_.pop_front();
    }
    return id;
}

std::optional<JobRequest> JobTable::request_of(const std::string &id) const {
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

std::vector<JobView> JobTable::take_all() {
    const std::lock_guard lock(mutex_);
    std::vector<JobView> views;
    for (Job &job : jobs_) {
        views.push_back({job.id, job.request, job.looks.take()});
    }
    return views;
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
