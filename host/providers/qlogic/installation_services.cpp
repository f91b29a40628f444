// The installation services of the QLogic adapters, one for each kind of port controller, and the
// jobs that both start.
#include "host/providers/kit/export.h"
#include "host/providers/kit/job_provider.h"
#include "host/providers/kit/port_service.h"
#include "host/providers/qlogic/adapter_parts.h"

namespace velkhost::providers {
namespace {

using scenario::Adapter;
using scenario::AdapterFamily;

constexpr const char *kJobClass = "QLogic_SoftwareInstallationJob";
constexpr const char *kName = "CNA_SW_INSTALLER";

// InstallOptions: "update", from the range that DSP1023 leaves to vendors.
constexpr std::uint16_t kUpdate = 32768;

class NicService final : public PortService {
  public:
    NicService()
        : PortService({.family = AdapterFamily::kQlogic,
                       .class_name = "QLogic_NIC_SoftwareInstallationService",
                       .name = kName,
                       .element_name = "Network adapter firmware update",
                       .system_class = qlogic::kSystemClass,
                       .port_class = qlogic::kNicPortClass,
                       .ports = &Adapter::nic_ports,
                       .options = {kUpdate},
                       .job_class = kJobClass}) {}
};

class FcService final : public PortService {
  public:
    FcService()
        : PortService({.family = AdapterFamily::kQlogic,
                       .class_name = "QLogic_FCHBA_SoftwareInstallationService",
                       .name = kName,
                       .element_name = "Fibre Channel adapter firmware update",
                       .system_class = qlogic::kSystemClass,
                       .port_class = qlogic::kFcPortClass,
                       .ports = &Adapter::fc_ports,
                       .options = {kUpdate},
                       .job_class = kJobClass}) {}
};

class InstallationJob final : public JobProvider {
  public:
    InstallationJob() : JobProvider(kJobClass, "qlogic.job") {}
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(QLogic_NIC_SoftwareInstallationServiceProvider,
                         velkhost::providers::NicService);
VELKHOST_EXPORT_PROVIDER(QLogic_FCHBA_SoftwareInstallationServiceProvider,
                         velkhost::providers::FcService);
VELKHOST_EXPORT_PROVIDER(QLogic_SoftwareInstallationJobProvider,
                         velkhost::providers::InstallationJob);
