// The jobs of the hypervisor's service, the ones from before the run included.
#pragma once

#include "host/providers/kit/job_table.h"

namespace velkhost::providers {

inline constexpr const char *kJobClass = "VMware_ConcreteJob";

class HypervisorJobs : public JobTable {
  public:
    // Fails while the scenario is unusable.
    HypervisorJobs();
};

}  // namespace velkhost::providers
