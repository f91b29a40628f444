#include "host/providers/emulex/converged_parts.h"

#include "host/providers/kit/export.h"
#include "host/providers/kit/naming.h"

namespace velkhost::providers {
namespace converged {
namespace {

// The ports of one adapter have the first identifying text in common; it is the serial number.
Instance port(const scenario::Adapter &adapter, const std::string &id) {
    Instance out{device_keys("OMC_UnitaryComputerSystem", kPortClass, id),
                 {{"InstanceID", Text("ELXUCNA:" + id)},
                  {"ElementName", Text(adapter.name)},
                  {"PermanentAddress", Text(id)},
                  {"FirmwareVersion", Text(adapter.firmware)}}};
    if (adapter.serial) {
        out.properties.push_back(
            {"OtherIdentifyingInfo", std::vector<std::string>{*adapter.serial, id}});
    }
    return out;
}

}  // namespace

std::vector<Instance> ports(const TaggedAdapter &adapter) {
    std::vector<Instance> out;
    for (const std::string &id : adapter.about.nic_ports) {
        out.push_back(port(adapter.about, id));
    }
    return out;
}

std::vector<Instance> connectors(const TaggedAdapter &adapter) {
    std::vector<Instance> out;
    const std::size_t count = adapter.about.connectors ? adapter.about.nic_ports.size() : 0;
    for (std::size_t i = 0; i < count; ++i) {
        out.push_back(
            {physical_keys(kConnectorClass, adapter.tag + "/port" + std::to_string(i)), {}});
    }
    return out;
}

std::vector<Instance> cards(const TaggedAdapter &adapter) {
    if (!adapter.about.card) {
        return {};
    }
    return {{physical_keys(kCardClass, adapter.tag),
             {{"ElementName", Text(adapter.about.name)},
              {"PartNumber", adapter.about.dfn},
              {"SerialNumber", adapter.about.serial}}}};
}

}  // namespace converged

namespace {

using scenario::AdapterFamily;

class EthernetPort final : public AdapterParts {
  public:
    EthernetPort()
        : AdapterParts(converged::kPortClass, AdapterFamily::kEmulexCna, converged::ports) {}
};

class PhysicalConnector final : public AdapterParts {
  public:
    PhysicalConnector()
        : AdapterParts(converged::kConnectorClass, AdapterFamily::kEmulexCna,
                       converged::connectors) {}
};

class Card final : public AdapterParts {
  public:
    Card() : AdapterParts(converged::kCardClass, AdapterFamily::kEmulexCna, converged::cards) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ELXUCNA_EthernetPortProvider, velkhost::providers::EthernetPort);
VELKHOST_EXPORT_PROVIDER(ELXUCNA_PhysicalConnectorProvider, velkhost::providers::PhysicalConnector);
VELKHOST_EXPORT_PROVIDER(ELXUCNA_CardProvider, velkhost::providers::Card);
