// What a converged adapter consists of: Ethernet ports, a connector for each, and one card.
#pragma once

#include "host/providers/kit/adapter_parts.h"

#include <vector>

namespace velkhost::providers::converged {

inline constexpr const char *kPortClass = "ELXUCNA_EthernetPort";
inline constexpr const char *kConnectorClass = "ELXUCNA_PhysicalConnector";
inline constexpr const char *kCardClass = "ELXUCNA_Card";

std::vector<Instance> ports(const TaggedAdapter &adapter);
// As many as there are ports, in their order; or none.
std::vector<Instance> connectors(const TaggedAdapter &adapter);
// One or none.
std::vector<Instance> cards(const TaggedAdapter &adapter);

}  // namespace velkhost::providers::converged
