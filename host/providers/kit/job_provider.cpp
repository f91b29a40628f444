#include "host/providers/kit/job_provider.h"

#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

#include <algorithm>
#include <utility>

namespace velkhost::providers {
namespace {

Instance describe(const JobView &job) {
    Instance out{{{"InstanceID", job.id}},
                 {{"Name", Text("InstallFromURI")},
                  {"JobStatus", job.look.job_status},
                  {"JobState", job.look.job_state}}};
    if (job.look.percent) {
        out.properties.push_back({"PercentComplete", *job.look.percent});
    }
    out.properties.push_back({"URI", job.request.uri});
    for (const Property &shown : job.request.shown) {
        out.properties.push_back(shown);
    }
    return out;
}

}  // namespace

JobProvider::JobProvider(const char *class_name, const char *step, Follow follow,
                         std::shared_ptr<JobTable> jobs)
    : class_name_(class_name), step_(step), follow_(follow), jobs_(std::move(jobs)) {
    scenario::Scenario::current();  // fails while it is unusable
}

std::vector<JobView> JobProvider::look_at_all() {
    if (follow_ == Follow::kByRead) {
        return jobs_->peek_all();
    }
    pass_step(step_, class_name_);
    return jobs_->take_all();
}

std::optional<JobView> JobProvider::look_at(const JobRequest &request, const std::string &id) {
    if (follow_ == Follow::kByRead) {
        pass_step(step_, request.uri);
        return jobs_->take_look(id);
    }
    const std::vector<JobView> all = jobs_->peek_all();
    const auto job = std::ranges::find(all, id, &JobView::id);
    return job == all.end() ? std::nullopt : std::optional(*job);
}

std::vector<Instance> JobProvider::instances() {
    std::vector<Instance> out;
    for (const JobView &job : look_at_all()) {
        if (!job.look.absent) {
            out.push_back(describe(job));
        }
    }
    return out;
}

Instance JobProvider::read(const Path &path) {
    const std::string id = path.key("InstanceID").value_or("");
    const auto request = jobs_->request_of(id);
    if (!request || path.key_count() != 1) {
        fail_not_found();
    }
    const auto job = look_at(*request, id);
    if (!job || job->look.absent) {
        fail_not_found();
    }
    return describe(*job);
}

}  // namespace velkhost::providers
