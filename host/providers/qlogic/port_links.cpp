// QLogic_NIC_PhysicalPackagePortController and its Fibre Channel twin: from an adapter to its port
// controllers of one kind.
#include "host/providers/kit/association_export.h"
#include "host/providers/qlogic/adapter_parts.h"

namespace velkhost::providers {
namespace {

using scenario::AdapterFamily;

constexpr Association::Roles kRoles{"Antecedent", "Dependent"};

std::vector<Link> links_to(const TaggedAdapter &adapter, const char *port_class,
                           const std::vector<Instance> &ports) {
    std::vector<Link> out;
    for (const Instance &package : qlogic::packages(adapter)) {
        for (const Instance &port : ports) {
            out.push_back({{qlogic::kPackageClass, package}, {port_class, port}});
        }
    }
    return out;
}

std::vector<Link> to_nic_ports(const TaggedAdapter &adapter) {
    return links_to(adapter, qlogic::kNicPortClass, qlogic::nic_ports(adapter));
}

std::vector<Link> to_fc_ports(const TaggedAdapter &adapter) {
    return links_to(adapter, qlogic::kFcPortClass, qlogic::fc_ports(adapter));
}

class NicPortLinks final : public AdapterLinks {
  public:
    NicPortLinks()
        : AdapterLinks("QLogic_NIC_PhysicalPackagePortController", kRoles, AdapterFamily::kQlogic,
                       to_nic_ports) {}
};

class FcPortLinks final : public AdapterLinks {
  public:
    FcPortLinks()
        : AdapterLinks("QLogic_FCHBA_PhysicalPackagePortController", kRoles, AdapterFamily::kQlogic,
                       to_fc_ports) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_ASSOCIATION(QLogic_NIC_PhysicalPackagePortControllerProvider,
                            velkhost::providers::NicPortLinks);
VELKHOST_EXPORT_ASSOCIATION(QLogic_FCHBA_PhysicalPackagePortControllerProvider,
                            velkhost::providers::FcPortLinks);
