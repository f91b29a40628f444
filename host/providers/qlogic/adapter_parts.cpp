#include "host/providers/qlogic/adapter_parts.h"

#include "host/providers/kit/export.h"
#include "host/providers/kit/naming.h"

namespace velkhost::providers {
namespace qlogic {
namespace {

std::vector<Instance> ports(const scenario::Adapter &adapter, const char *class_name,
                            const std::vector<std::string> &ids) {
    std::vector<Instance> out;
    for (const std::string &id : ids) {
        out.push_back(
            {device_keys(kSystemClass, class_name, id),
             {{"ElementName", Text(adapter.name)}, {"FirmwareVersion", Text(adapter.firmware)}}});
    }
    return out;
}

}  // namespace

std::vector<Instance> packages(const TaggedAdapter &adapter) {
    return {{physical_keys(kPackageClass, adapter.tag),
             {{"ElementName", Text(adapter.about.name)},
              {"Model", adapter.about.dfn},
              {"SerialNumber", adapter.about.serial}}}};
}

std::vector<Instance> nic_ports(const TaggedAdapter &adapter) {
    return ports(adapter.about, kNicPortClass, adapter.about.nic_ports);
}

std::vector<Instance> fc_ports(const TaggedAdapter &adapter) {
    return ports(adapter.about, kFcPortClass, adapter.about.fc_ports);
}

}  // namespace qlogic

namespace {

using scenario::AdapterFamily;

class PhysicalPackage final : public AdapterParts {
  public:
    PhysicalPackage()
        : AdapterParts(qlogic::kPackageClass, AdapterFamily::kQlogic, qlogic::packages) {}
};

class NicPortController final : public AdapterParts {
  public:
    NicPortController()
        : AdapterParts(qlogic::kNicPortClass, AdapterFamily::kQlogic, qlogic::nic_ports) {}
};

class FcPortController final : public AdapterParts {
  public:
    FcPortController()
        : AdapterParts(qlogic::kFcPortClass, AdapterFamily::kQlogic, qlogic::fc_ports) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(QLogic_Adapter_PhysicalPackageProvider,
                         velkhost::providers::PhysicalPackage);
VELKHOST_EXPORT_PROVIDER(QLogic_NIC_PortControllerProvider, velkhost::providers::NicPortController);
VELKHOST_EXPORT_PROVIDER(QLogic_FCHBA_PortControllerProvider,
                         velkhost::providers::FcPortController);
