#include "host/providers/hypervisor/hypervisor_jobs.h"

#include "host/scenario/scenario.h"

namespace velkhost::providers {

HypervisorJobs::HypervisorJobs() {
    const auto scenario = scenario::Scenario::current();
    for (const std::string &status : scenario->hypervisor.earlier_jobs) {
        start(kJobClass, {}, {{status, scenario::kJobCompleted, 1, false}});
    }
}

}  // namespace velkhost::providers
