// BROCADE_HBASoftwareInstallationService: has done its work when it returns.
#include "host/providers/kit/export.h"
#include "host/providers/kit/port_service.h"

namespace velkhost::providers {
namespace {

// InstallOptions (DSP1023).
constexpr std::uint16_t kInstall = 4;
constexpr std::uint16_t kUpdate = 5;

class HbaService final : public PortService {
  public:
    HbaService()
        : PortService({.family = scenario::AdapterFamily::kBrocade,
                       .class_name = "BROCADE_HBASoftwareInstallationService",
                       .name = "Brocade Adapter Software Update Service",
                       .element_name = "Fibre Channel adapter firmware update",
                       .system_class = "BROCADE_ComputerSystem",
                       .port_class = "BROCADE_PortController",
                       .ports = &scenario::Adapter::fc_ports,
                       .options = {kInstall, kUpdate}}) {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(BROCADE_HBASoftwareInstallationServiceProvider,
                         velkhost::providers::HbaService);
