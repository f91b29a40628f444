// ELXHBA_FCPort and ELXHBA_VitalProductData: the ports of the Fibre Channel adapters, and what the
// adapter tells of itself behind each of them.
#include "host/providers/kit/adapter_parts.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/naming.h"

namespace velkhost::providers {
namespace {

using scenario::AdapterFamily;

std::vector<Instance> ports(const TaggedAdapter &adapter) {
    std::vector<Instance> out;
    for (const std::string &id : adapter.about.fc_ports) {
        out.push_back({device_keys("OMC_UnitaryComputerSystem", "ELXHBA_FCPort", id),
                       {{"ElementName", Text(adapter.about.name)},
                        {"PermanentAddress", Text(id)},
                        {"FirmwareVersion", Text(adapter.about.firmware)}}});
    }
    return out;
}

// One record for each port, which bears the port's device id. Field V2 is where these adapters
// have the identifier of their model.
std::vector<Instance> vital_product_data(const TaggedAdapter &adapter) {
    std::vector<Instance> out;
    for (const std::string &id : adapter.about.fc_ports) {
        out.push_back({{{"InstanceID", Text(id)}},
                       {{"ElementName", Text(adapter.about.name)},
                        {"SerialNumber", adapter.about.serial},
                        {"FieldV2", adapter.about.dfn}}});
    }
    return out;
}

class FcPort final : public AdapterParts {
  public:
    FcPort() : AdapterParts("ELXHBA_FCPort", AdapterFamily::kEmulexFc, ports) {}
};

class VitalProductData final : public AdapterParts {
  public:
    VitalProductData()
        : AdapterParts("ELXHBA_VitalProductData", AdapterFamily::kEmulexFc, vital_product_data) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ELXHBA_FCPortProvider, velkhost::providers::FcPort);
VELKHOST_EXPORT_PROVIDER(ELXHBA_VitalProductDataProvider, velkhost::providers::VitalProductData);
