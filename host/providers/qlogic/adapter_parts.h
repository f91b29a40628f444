// What a QLogic adapter consists of: one physical package, and port controllers of two kinds.
#pragma once

#include "host/providers/kit/adapter_parts.h"

#include <vector>

namespace velkhost::providers::qlogic {

inline constexpr const char *kSystemClass = "QLogic_Adapter_ComputerSystem";
inline constexpr const char *kPackageClass = "QLogic_Adapter_PhysicalPackage";
inline constexpr const char *kNicPortClass = "QLogic_NIC_PortController";
inline constexpr const char *kFcPortClass = "QLogic_FCHBA_PortController";

// One.
std::vector<Instance> packages(const TaggedAdapter &adapter);
std::vector<Instance> nic_ports(const TaggedAdapter &adapter);
std::vector<Instance> fc_ports(const TaggedAdapter &adapter);

}  // namespace velkhost::providers::qlogic
