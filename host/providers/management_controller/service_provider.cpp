// ZEB_SoftwareInstallationService: installs system firmware through the management controller.
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/installation_service.h"
#include "host/providers/kit/naming.h"
#include "host/providers/kit/shared_while_used.h"
#include "host/providers/kit/step_fault.h"
#include "host/providers/management_controller/controller_texts.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {
namespace {

using scenario::Scenario;

// What a caller asks for.
struct UpdateRequest {
    std::string uri;
    std::uint8_t update_operation = 0;  // 0 primary bank, 1 backup bank
    std::uint8_t reboot_option = 0;     // 1: the controller restarts after the update
};

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

NewJob make_job(const UpdateRequest &request) {
    return {"ZEB_SoftwareInstallationJob",
            {request.uri,
             {{"Update_Operation", request.update_operation},
              {"reboot_option", request.reboot_option}}},
            usual_job(request.uri, request.reboot_option == 1)};
}

class SoftwareInstallationService final : public InstallationService {
  public:
    SoftwareInstallationService()
        : InstallationService("ZEB_SoftwareInstallationService",
                              "Management controller firmware update") {}

  protected:
    [[nodiscard]] std::vector<Property> keys() const override;
    MethodResult install(const Args &in) override;

  private:
    std::shared_ptr<JobTable> jobs_ = shared_while_used<JobTable>();
};

// The service's name is spelled so by the controller.
std::vector<Property> SoftwareInstallationService::keys() const {
    return service_keys("ZEB_ManagementController", "ManagementController", class_name(),
                        "RXCSoftwareInstallatiIonService");
}

MethodResult SoftwareInstallationService::install(const Args &in) {
    const UpdateRequest request = read_request(in);
    pass_step("zeb.install", request.uri);
    if (!is_accessible(request.uri)) {
        return {kUriNotAccessible, {}};
    }
    return job_result(Scenario::current()->management_controller.next(request.uri), *jobs_,
                      make_job(request));
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_SoftwareInstallationServiceProvider,
                         velkhost::providers::SoftwareInstallationService);
