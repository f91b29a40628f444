#include "host/providers/hypervisor/naming.h"

#include "host/providers/kit/naming.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {

std::vector<std::string> hypervisor_systems() {
    const auto scenario = scenario::Scenario::current();
    return scenario->hypervisor.systems.value_or(std::vector{scenario->host.node});
}

std::vector<Property> hypervisor_service_keys(const std::string &system) {
    return service_keys(kSystemClass, system, kServiceClass, "SoftwareInstallationService");
}

std::vector<Property> system_keys(const std::string &system) {
    return {{"CreationClassName", Text(kSystemClass)}, {"Name", Text(system)}};
}

}  // namespace velkhost::providers
