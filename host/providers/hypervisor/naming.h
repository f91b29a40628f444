// The hypervisor's systems, and how it names what belongs to them.
#pragma once

#include "host/providers/kit/data.h"

#include <string>
#include <vector>

namespace velkhost::providers {

inline constexpr const char *kSystemClass = "OMC_UnitaryComputerSystem";
inline constexpr const char *kServiceClass = "VMware_SoftwareInstallationService";

// The systems that have an installation service.
std::vector<std::string> hypervisor_systems();

std::vector<Property> hypervisor_service_keys(const std::string &system);
std::vector<Property> system_keys(const std::string &system);

}  // namespace velkhost::providers
