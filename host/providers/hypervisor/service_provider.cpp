// VMware_SoftwareInstallationService: installs bundles of the hypervisor's updates.
#include "host/providers/hypervisor/depot.h"
#include "host/providers/hypervisor/hypervisor_jobs.h"
#include "host/providers/hypervisor/installed_vibs.h"
#include "host/providers/hypervisor/naming.h"
#include "host/providers/hypervisor/update_course.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/installation_service.h"
#include "host/providers/kit/local_file.h"
#include "host/providers/kit/shared_while_used.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {
namespace {

using scenario::Scenario;

// One instance for every system.
class HypervisorService final : public Provider {
  public:
    [[nodiscard]] const char *class_name() const override { return kServiceClass; }

    std::vector<Instance> instances() override;
    MethodResult invoke(const Path &target, const std::string &method, const Args &in) override;
    // The running updates would be forgotten.
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    MethodResult install(const std::string &uri);
    std::vector<scenario::JobLook> course_of(const std::string &uri);

    std::shared_ptr<HypervisorJobs> jobs_ = shared_while_used<HypervisorJobs>();
    InstalledVibs installed_{Scenario::current()->hypervisor.installed};
};

std::vector<Instance> HypervisorService::instances() {
    std::vector<Instance> out;
    for (const std::string &system : hypervisor_systems()) {
        out.push_back(
            {hypervisor_service_keys(system), {{"ElementName", Text("Hypervisor update")}}});
    }
    return out;
}

MethodResult HypervisorService::invoke(const Path &target, const std::string &method,
                                       const Args &in) {
    if (!same_name(method, "InstallFromURI")) {
        fail_no_method(method);
    }
    read(target);
    const std::string uri = in.text("URI");
    const Path system = in.reference("Target");
    if (!system.names({kSystemClass, system_keys(target.key("SystemName").value_or(""))})) {
        return {kUnsupportedTarget, {}};
    }
    return install(uri);
}

MethodResult HypervisorService::install(const std::string &uri) {
    pass_step("hypervisor.install", uri);
    const scenario::ServiceAnswer answer = Scenario::current()->hypervisor_service.next(uri);
    NewJob job{kJobClass, {uri, {}}, {}};
    const bool starts = answer.status == CMPI_RC_OK && answer.return_value == scenario::kJobStarted;
    if (starts && !answer.job) {
        job.usual = course_of(uri);
    }
    return job_result(answer, *jobs_, job);
}

// What an update from there comes to. A bundle that cannot be used shows only in its job, as it is
// the job that looks into it.
std::vector<scenario::JobLook> HypervisorService::course_of(const std::string &uri) {
    const auto path = path_of_file_uri(uri);
    if (!path) {
        return failed_course("this host has no client for " + uri);
    }
    try {
        return installed_.take_later(read_depot(*path)) ? completed_course() : obsolete_course();
    } catch (const DepotError &error) {
        return failed_course(error.what());
    }
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(VMware_SoftwareInstallationServiceProvider,
                         velkhost::providers::HypervisorService);
