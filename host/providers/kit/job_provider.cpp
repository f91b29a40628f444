#include "host/providers/kit/job_provider.h"

#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

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

JobProvider::JobProvider(const char *class_name, const char *step)
    : class_name_(class_name), step_(step) {
    scenario::Scenario::current();  // fails while it is unusable
}

std::vector<Instance> JobProvider::instances() {
    std::vector<Instance> out;
    for (const JobView &job : jobs_->peek_all()) {
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
    pass_step(step_, request->uri);
    const auto job = jobs_->take_look(id);
    if (!job || job->look.absent) {
        fail_not_found();
    }
    return describe(*job);
}

}  // namespace velkhost::providers
