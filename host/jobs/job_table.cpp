#include "host/jobs/job_table.h"

#include <stdexcept>
#include <utility>

#include "host/jobs/poller.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

namespace velkhost::jobs {

JobTable &JobTable::instance() {
    static auto *const table = new JobTable;
    return *table;
}

std::shared_ptr<Job> JobTable::create(Registration registration, std::size_t longest_id) {
    const auto first_number = scenario::Scenario::current()->jobs.first_number;
    const std::lock_guard lock(mutex_);
    const std::string id =
        registration.provider_name + "-" + std::to_string(first_number + issued_);
    if (id.size() > longest_id) {
        throw std::length_error("a job id of " + std::to_string(id.size()) + " characters");
    }
    providers::pass_step("job.create", id);
    auto job = std::make_shared<Job>(id, std::move(registration));
    start_polling(job);  // the new thread's first act is a pause
    jobs_[id] = job;
    ++issued_;
    return job;
}

std::vector<std::shared_ptr<Job>> JobTable::all() const {
    const std::lock_guard lock(mutex_);
    std::vector<std::shared_ptr<Job>> jobs;
    for (const auto &[id, job] : jobs_) {
        jobs.push_back(job);
    }
    return jobs;
}

std::vector<std::shared_ptr<Job>> JobTable::list() {
    auto jobs = all();
    std::erase_if(jobs, [this](const auto &job) { return !bring_up_to_date(*job); });
    return jobs;
}

std::shared_ptr<Job> JobTable::find(const std::string &id) {
    std::shared_ptr<Job> job;
    {
        const std::lock_guard lock(mutex_);
        const auto place = jobs_.find(id);
        if (place == jobs_.end()) {
            return nullptr;
        }
        job = place->second;
    }
    return bring_up_to_date(*job) ? job : nullptr;
}

bool JobTable::bring_up_to_date(Job &job) {
    if (!job.has_ended()) {
        return true;
    }
    job.refresh();
    if (now_us() < *job.removal_us()) {
        return holds(job);
    }
    remove(job.id());
    return false;
}

bool JobTable::remove(const std::string &id) {
    std::shared_ptr<Job> job;
    {
        const std::lock_guard lock(mutex_);
        const auto taken = jobs_.extract(id);
        if (taken.empty()) {
            return false;
        }
        job = taken.mapped();
    }
    job->clean_up();
    return true;
}

bool JobTable::is_empty() const {
    const std::lock_guard lock(mutex_);
    return jobs_.empty();
}

bool JobTable::holds(const Job &job) const {
    const std::lock_guard lock(mutex_);
    const auto place = jobs_.find(job.id());
    return place != jobs_.end() && place->second.get() == &job;
}

void JobTable::abandon() {
    const std::lock_guard lock(mutex_);
    jobs_.clear();
}

}  // namespace velkhost::jobs
