// The installation services of the Emulex adapters. Both have done their work when they return.
#include "host/providers/kit/export.h"
#include "host/providers/kit/port_service.h"

namespace velkhost::providers {
namespace {

using scenario::Adapter;
using scenario::AdapterFamily;

class FibreChannelService final : public PortService {
  public:
    FibreChannelService()
        : PortService({.family = AdapterFamily::kEmulexFc,
                       .class_name = "ELXHBA_SoftwareInstallationService",
                       .name = "ELXHBA_FCSoftwareInstallationService",
                       .element_name = "Fibre Channel adapter firmware update",
                       .system_class = "OMC_UnitaryComputerSystem",
                       .port_class = "ELXHBA_FCPort",
                       .ports = &Adapter::fc_ports}) {}
};

class ConvergedService final : public PortService {
  public:
    ConvergedService()
        : PortService({.family = AdapterFamily::kEmulexCna,
                       .class_name = "ELXUCNA_SoftwareInstallationService",
                       .name = "ELXUCNA_SoftwareInstallationService",
                       .element_name = "Converged adapter firmware update",
                       .system_class = "OMC_UnitaryComputerSystem",
                       .port_class = "ELXUCNA_EthernetPort",
                       .ports = &Adapter::nic_ports}) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ELXHBA_SoftwareInstallationServiceProvider,
                         velkhost::providers::FibreChannelService);
VELKHOST_EXPORT_PROVIDER(ELXUCNA_SoftwareInstallationServiceProvider,
                         velkhost::providers::ConvergedService);
