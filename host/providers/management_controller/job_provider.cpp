// ZEB_SoftwareInstallationJob: how far an update of the management controller is.
#include "host/providers/kit/export.h"
#include "host/providers/kit/shared_while_used.h"
#include "host/providers/kit/step_fault.h"
#include "host/providers/management_controller/job_table.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {
namespace {

Instance describe(const JobView &job) {
    return {{{"InstanceID", job.id}},
            {{"Name", Text("InstallFromURI")},
             {"JobStatus", job.look.job_status},
             {"JobState", job.look.job_state},
             {"URI", job.request.uri},
             {"Update_Operation", job.request.update_operation},
             {"reboot_option", job.request.reboot_option}}};
}

class SoftwareInstallationJob final : public Provider {
  public:
    SoftwareInstallationJob() { scenario::Scenario::current(); }  // fails while it is unusable

    [[nodiscard]] const char *class_name() const override { return "ZEB_SoftwareInstallationJob"; }

    std::vector<Instance> instances() override;
    Instance read(const Path &path) override;
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    // The service starts the jobs that are shown here.
    std::shared_ptr<JobTable> jobs_ = shared_while_used<JobTable>();
};

std::vector<Instance> SoftwareInstallationJob::instances() {
    std::vector<Instance> out;
    for (const JobView &job : jobs_->peek_all()) {
        if (!job.look.absent) {
            out.push_back(describe(job));
        }
    }
    return out;
}

Instance SoftwareInstallationJob::read(const Path &path) {
    const std::string id = path.key("InstanceID").value_or("");
    const auto request = jobs_->request_of(id);
    if (!request || path.key_count() != 1) {
        fail_not_found();
    }
    pass_step("zeb.job", request->uri);
    const auto job = jobs_->take_look(id);
    if (!job || job->look.absent) {
        fail_not_found();
    }
    return describe(*job);
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_SoftwareInstallationJobProvider,
                         velkhost::providers::SoftwareInstallationJob);
