// BROCADE_PhysicalPackage and BROCADE_PortController: an adapter and its ports. No association
// leads from one to the other; a port's name is the serial number of the adapter that it belongs
// to.
#include "host/providers/kit/adapter_parts.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/naming.h"

namespace velkhost::providers {
namespace {

using scenario::AdapterFamily;

std::vector<Instance> packages(const TaggedAdapter &adapter) {
    return {{physical_keys("BROCADE_PhysicalPackage", adapter.tag),
             {{"ElementName", Text(adapter.about.name)},
              {"Model", adapter.about.dfn},
              {"SerialNumber", adapter.about.serial}}}};
}

std::vector<Instance> ports(const TaggedAdapter &adapter) {
    std::vector<Instance> out;
    for (const std::string &id : adapter.about.fc_ports) {
        out.push_back(
            {device_keys("BROCADE_ComputerSystem", "BROCADE_PortController", id),
             {{"ElementName", Text(adapter.about.name)},
              {"Name", adapter.about.port_name ? adapter.about.port_name : adapter.about.serial},
              {"FirmwareVersion", Text(adapter.about.firmware)}}});
    }
    return out;
}

class PhysicalPackage final : public AdapterParts {
  public:
    PhysicalPackage()
        : AdapterParts("BROCADE_PhysicalPackage", AdapterFamily::kBrocade, packages) {}
};

class PortController final : public AdapterParts {
  public:
    PortController() : AdapterParts("BROCADE_PortController", AdapterFamily::kBrocade, ports) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(BROCADE_PhysicalPackageProvider, velkhost::providers::PhysicalPackage);
VELKHOST_EXPORT_PROVIDER(BROCADE_PortControllerProvider, velkhost::providers::PortController);
