// ZEB_SoftwareInstallationJob: how far an update of the management controller is.
#include "host/providers/kit/job_provider.h"
#include "host/providers/kit/export.h"

namespace velkhost::providers {
namespace {

class SoftwareInstallationJob final : public JobProvider {
  public:
    SoftwareInstallationJob() : JobProvider("ZEB_SoftwareInstallationJob", "zeb.job") {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_SoftwareInstallationJobProvider,
                         velkhost::providers::SoftwareInstallationJob);
