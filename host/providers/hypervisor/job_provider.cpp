// VMware_ConcreteJob: how far updates of the hypervisor are.
#include "host/providers/kit/job_provider.h"
#include "host/providers/hypervisor/hypervisor_jobs.h"
#include "host/providers/kit/export.h"

namespace velkhost::providers {
namespace {

class HypervisorJob final : public JobProvider {
  public:
    HypervisorJob()
        : JobProvider(kJobClass, "hypervisor.jobs", Follow::kByEnumeration,
                      shared_while_used<HypervisorJobs>()) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(VMware_ConcreteJobProvider, velkhost::providers::HypervisorJob);
