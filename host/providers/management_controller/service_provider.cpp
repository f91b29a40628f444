// ZEB_SoftwareInstallationService: installs system firmware through the management controller.
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/local_file.h"
#include "host/providers/kit/shared_while_used.h"
#include "host/providers/kit/step_fault.h"
#include "host/providers/management_controller/controller_texts.h"
#include "host/providers/management_controller/job_table.h"
#include "host/scenario/scenario.h"

#include <utility>

namespace velkhost::providers {
namespace {

using scenario::Scenario;
using scenario::ServiceAnswer;

// Return value of CIM_SoftwareInstallationService methods: the URI cannot be reached.
constexpr std::uint32_t kUriNotAccessible = 4107;

// The service's name is spelled so by the controller.
std::vector<Property> service_keys() {
    return {{"SystemCreationClassName", Text("ZEB_ManagementController")},
            {"SystemName", Text("ManagementController")},
            {"CreationClassName", Text("ZEB_SoftwareInstallationService")},
            {"Name", Text("RXCSoftwareInstallatiIonService")}};
}

std::uint8_t switch_argument(const Args &in, const char *name) {
    const std::uint8_t value = in.uint8(name);
    if (value > 1) {
        throw CimError(
            CMPI_RC_ERR_INVALID_PARAMETER,
            std::string("Parameter ") + name + " must be 0 or 1, not " + std::to_string(value));
    }
    return value;
}

UpdateRequest read_request(const Args &in) {
    return {in.text("URI"), switch_argument(in, "Update_Operation"),
            switch_argument(in, "reboot_option")};
}

bool is_accessible(const std::string &uri) {
    const auto path = path_of_file_uri(uri);
    return path && is_readable_file(*path);
}

class SoftwareInstallationService final : public Provider {
  public:
    SoftwareInstallationService() { Scenario::current(); }  // fails while it is unusable

    [[nodiscard]] const char *class_name() const override {
        return "ZEB_SoftwareInstallationService";
    }

    std::vector<Instance> instances() override;
    MethodResult invoke(const Path &target, const std::string &method, const Args &in) override;
    // The controller's jobs would be forgotten.
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    MethodResult install(const UpdateRequest &request);
    MethodResult answer_as(ServiceAnswer answer, const UpdateRequest &request);

    std::shared_ptr<JobTable> jobs_ = shared_while_used<JobTable>();
};

std::vector<Instance> SoftwareInstallationService::instances() {
    return {{service_keys(), {{"ElementName", Text("Management controller firmware update")}}}};
}

MethodResult SoftwareInstallationService::invoke(const Path &target, const std::string &method,
                                                 const Args &in) {
    if (!same_name(method, "InstallFromURI")) {
        fail_no_method(method);
    }
    if (!target.has_exactly(service_keys())) {
        fail_not_found();
    }
    return install(read_request(in));
}

MethodResult SoftwareInstallationService::install(const UpdateRequest &request) {
    pass_step("zeb.install", request.uri);
    if (!is_accessible(request.uri)) {
        return {kUriNotAccessible, {}};
    }
    return answer_as(Scenario::current()->management_controller.next(request.uri), request);
}

MethodResult SoftwareInstallationService::answer_as(ServiceAnswer answer,
                                                    const UpdateRequest &request) {
    if (answer.status != CMPI_RC_OK) {
        throw CimError(static_cast<CMPIrc>(answer.status), answer.message);
    }
    MethodResult result{answer.return_value, {}};
    if (answer.return_value != scenario::kJobStarted) {
        return result;
    }
    if (!answer.job) {
        answer.job = usual_job(request.uri, request.reboot_option == 1);
    }
    if (!answer.job->empty()) {
        const std::string id = jobs_->start(request, *std::move(answer.job));
        result.outputs.push_back(
            {"Job", Reference{"ZEB_SoftwareInstallationJob", {{"InstanceID", id}}}});
    }
    return result;
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_SoftwareInstallationServiceProvider,
                         velkhost::providers::SoftwareInstallationService);
