// ELXUCNA_Realizes and ELXUCNA_Container: from a converged adapter's port to its connector, and
// from there to the card.
#include "host/providers/emulex/converged_parts.h"
#include "host/providers/kit/association_export.h"

namespace velkhost::providers {
namespace {

using scenario::AdapterFamily;

std::vector<Link> realizes(const TaggedAdapter &adapter) {
    const std::vector<Instance> ports = converged::ports(adapter);
    const std::vector<Instance> connectors = converged::connectors(adapter);
    std::vector<Link> out;
    for (std::size_t i = 0; i < connectors.size(); ++i) {
        out.push_back(
            {{converged::kConnectorClass, connectors[i]}, {converged::kPortClass, ports[i]}});
    }
    return out;
}

std::vector<Link> contains(const TaggedAdapter &adapter) {
    std::vector<Link> out;
    for (const Instance &card : converged::cards(adapter)) {
        for (const Instance &connector : converged::connectors(adapter)) {
            out.push_back({{converged::kCardClass, card}, {converged::kConnectorClass, connector}});
        }
    }
    return out;
}

class Realizes final : public AdapterLinks {
  public:
    Realizes()
        : AdapterLinks("ELXUCNA_Realizes", {"Antecedent", "Dependent"}, AdapterFamily::kEmulexCna,
                       realizes) {}
};

class Container final : public AdapterLinks {
  public:
    Container()
        : AdapterLinks("ELXUCNA_Container", {"GroupComponent", "PartComponent"},
                       AdapterFamily::kEmulexCna, contains) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_ASSOCIATION(ELXUCNA_RealizesProvider, velkhost::providers::Realizes);
VELKHOST_EXPORT_ASSOCIATION(ELXUCNA_ContainerProvider, velkhost::providers::Container);
