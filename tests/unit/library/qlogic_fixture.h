// QLogic adapters and their two kinds of functions.
#pragma once

#include "installers/Qlogic_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {

// What distinguishes network and Fibre Channel functions.
struct QlogicKind {
    const char *name;
    void (*furnish)(AdapterTest &);
    int (*install_all)(int, const CMPIContext *, const CMPIInstance *);
    int (*install_one)(const CMPIContext *, const char *, const CMPIInstance *);
    const char *service;
    const char *port;
    const char *association;
    const char *letters;        // in the functions' names
    const char *system_label;   // "Qlogic SystemName ="
    const char *service_word;   // as the log names the service
    const char *no_target;      // the line for a port controller without a path
    const char *update;         // "nic" or "fc"
    const char *payload_begin;  // the payloads' line up to the number, and from there on
    const char *payload_end;
};

inline void PrintTo(const QlogicKind &kind, std::ostream *out) {
    *out << kind.name;
}

inline constexpr QlogicKind kQlogicNic = {
    .name = "Nic",
    .furnish = furnish_qlogic_nic,
    .install_all = installQlgNICpayload,
    .install_one = installSingleQlgNICpayload,
    .service = "QLogic_NIC_SoftwareInstallationService",
    .port = "QLogic_NIC_PortController",
    .association = "QLogic_NIC_PhysicalPackagePortController",
    .letters = "NIC",
    .system_label = "Qlogic NIC SystemName =",
    .service_word = "QLogic_NIC_SoftwareInstallationService",
    .no_target = "Create QLogic_NIC_PortController failed.\n",
    .update = "nic",
    .payload_begin = "Install Qlogic  ",
    .payload_end = " package. Payload path: ",
};

inline constexpr QlogicKind kQlogicFc = {
    .name = "Fc",
    .furnish = furnish_qlogic_fc,
    .install_all = installQlgFCpayload,
    .install_one = installSingleQlgFCpayload,
    .service = "QLogic_FCHBA_SoftwareInstallationService",
    .port = "QLogic_FCHBA_PortController",
    .association = "QLogic_FCHBA_PhysicalPackagePortController",
    .letters = "FC",
    .system_label = "Qlogic SystemName =",
    .service_word = "QLogicFCHBA_SoftwareInstallationService",
    .no_target = "Create OMC_UnitaryComputerSystem failed.\n",
    .update = "fc",
    .payload_begin = "Install ",
    .payload_end = " Qlogic package. Payload path: ",
};

class QlogicTest : public AdapterTest {
  protected:
    VendorClass &job() { return vendor("QLogic_UpdateJob"); }
    std::vector<VendorInstance> &adapters() {
        return vendor("QLogic_Adapter_PhysicalPackage").instances;
    }
    auto &ports_of(const QlogicKind &kind, const std::string &adapter) {
        return vendor(kind.association).linked[adapter];
    }
    static VendorInstance port(const std::string &device) {
        return {{{"DeviceID", text(device)}}, {}};
    }

    // The payloads and targets that services were given: "fw.bin to port-1".
    std::vector<std::string> installs() {
        std::vector<std::string> out;
        for (const std::string &call : up_calls()) {
            if (const auto file = call.find("Package/"); file != std::string::npos) {
                const auto device = call.find("DeviceID=\"") + 10;
                out.push_back(call.substr(file + 8, call.find('"', file) - file - 8) + " to " +
                              call.substr(device, call.find('"', device) - device));
            }
        }
        return out;
    }
};

}  // namespace velktest
