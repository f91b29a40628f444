#include "installers/Emulex_update.h"

#include <array>

#include "installers/adapter_frame.h"
#include "installers/adapter_service.h"
#include "installers/adapter_session.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk::emulex {
namespace {

constexpr const char *kNamespace = "root/emulex";
constexpr const char *kSystemClass = "OMC_UnitaryComputerSystem";

// clang-format off
constexpr std::array kStatuses = {
    adapter::StatusRow{adapter::kSucceeded,         50, "Package installation successfully."},
    adapter::StatusRow{adapter::kNoObjectPath,      54, "Error when create input parameter and the installation failed."},
    adapter::StatusRow{adapter::kUnsupportedTarget, 58, "Unsupported target type."},
    adapter::StatusRow{adapter::kUriNotAccessible,  55, "The path or file does not exist."},
};
// clang-format on

constexpr adapter::AdapterFamily kFibreChannel = {
    .enter_line = "--> installElxFCPkg.\n",
    .discover = get_elxfc_dfn_devid,
    .no_adapter_message = "No driver file name that need to be update.\n",
    .no_adapter_result = adapter::kCallFailed,
    .unpack_must_succeed = true,
    .unpacked_line = "Minizip() successfully.\n",
    .matches_payloads = true,
    .mismatch_line = "parsePayloadDeviceIDArray() failed.\n",
    .watcher = query_fw_update_emulex,
    .install = install_elxfc_payload,
    .removed_line = "util_remove_file() successfully.\n",
    .not_removed_line = "util_remove_file() failed.\n",
    .statuses = kStatuses,
    .exit_line = "<-- installElxFCPkg.\n",
    .returns_removal = true,
};

constexpr adapter::AdapterFamily make_converged() {
    adapter::AdapterFamily family = kFibreChannel;
    family.enter_line = "--> installElxCNAPkg\n";
    family.discover = get_elxcna_dfn_devid;
    family.no_adapter_message = "No driver file name that need to be update.";
    family.install = install_elxcna_payload;
    family.exit_line = "<-- installElxCNAPkg\n";
    return family;
}

constexpr adapter::AdapterFamily kConverged = make_converged();

// What distinguishes one payload's install on the two kinds of adapter.
struct Service {
    const char *enter_line;
    const char *exit_line;
    const char *service_class;
    const char *service_name;
    const char *service_line;
    const char *target_class;
};

constexpr Service kFibreChannelService = {
    .enter_line = "--> install_one_elxfc_payload.\n",
    .exit_line = "<-- install_one_elxfc_payload.\n",
    .service_class = "ELXHBA_SoftwareInstallationService",
    .service_name = "ELXHBA_FCSoftwareInstallationService",
    .service_line = "Succeed in creating ELXHBA_SoftwareInstallationService.\n",
    .target_class = "ELXHBA_FCPort",
};

constexpr Service kConvergedService = {
    .enter_line = "--> install_one_elxcna_payload\n",
    .exit_line = "<-- install_one_elxcna_payload\n",
    .service_class = "ELXUCNA_SoftwareInstallationService",
    .service_name = "ELXUCNA_SoftwareInstallationService",
    .service_line = "Succeed in creating ELXUCNA_SoftwareInstallationService\n",
    .target_class = "ELXUCNA_EthernetPort",
};

cim::Path make_target(const Service &service, const adapter::SystemName &system,
                      const char *device) {
    cim::Path target = cim::make_path(kNamespace, service.target_class);
    cim::add_key(target, "SystemCreationClassName", kSystemClass);
    cim::add_key(target, "SystemName", system.get());
    cim::add_key(target, "CreationClassName", service.target_class);
    cim::add_key(target, "DeviceID", device);
    return target;
}

int call_service(const Service &service, const CMPIContext *context, const cim::Path &path,
                 const cim::Path &target, const char *payload) {
    const cim::Args in = cim::make_args();
    const cim::Args out = cim::make_args();
    const adapter::PayloadUri uri = adapter::payload_uri(payload);
    cim::add_reference(in.get(), "Target", target.get());
    cim::add_text(in, "URI", uri.c_str());
    log_format("To install package: %s\n", uri.c_str());
    const cim::Call call = cim::invoke(context, path, "InstallFromURI", in, out);
    int result = call.value;
    if (call.status.rc == CMPI_RC_OK) {
        log_format("CBInvokeMethod() return code: %d\n", call.value);
    } else {
        log_format("Package installation error message: %s\n", cim::message_of(call.status));
        result = adapter::kCallFailed;
    }
    log_entry(service.exit_line);
    return result;
}

int install_one(const Service &service, const CMPIContext *context, const char *payload,
                const char *device) {
    log_entry(service.enter_line);
    cim::Path path = cim::make_path(kNamespace, service.service_class);
    adapter::SystemName system;
    system.find(context, path, [&](const char *name) {
        log_format("%s.SystemName = %s\n", service.service_class, name);
    });
    cim::add_key(path, "SystemCreationClassName", kSystemClass);
    cim::add_key(path, "SystemName", system.get());
    cim::add_key(path, "CreationClassName", service.service_class);
    cim::add_key(path, "Name", service.service_name);
    if (!path) {
        return adapter::kNoObjectPath;
    }
    log_entry(service.service_line);
    const cim::Path target = make_target(service, system, device);
    if (!target) {
        return adapter::kNoObjectPath;
    }
    log_format("Succeed in creating %s: SystemName = %s, DeviceID = %s\n", service.target_class,
               system.text(), device);
    return call_service(service, context, path, target, payload);
}

constexpr const char *kPayloadLine = "Install Emulex %d package. Payload path: %s, Device ID: %s\n";

}  // namespace
}  // namespace velk::emulex

int installElxFCPkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::emulex::kFibreChannel, idx, context);
}

int installElxCNAPkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::emulex::kConverged, idx, context);
}

int install_elxfc_payload(int idx, const CMPIContext *context) {
    velk::log_entry("--> install_elxfc_payload.\n");
    return velk::adapter::install_payloads(
        idx, velk::emulex::kPayloadLine, "Error return from install_one_elxfc_payload(): %d\n",
        [=](const char *path, const char *device) {
            return install_one_elxfc_payload(context, path, device);
        });
}

int install_elxcna_payload(int idx, const CMPIContext *context) {
    velk::log_entry("--> install_elxcna_payload\n");
    return velk::adapter::install_payloads(
        idx, velk::emulex::kPayloadLine, "install_one_elxcna_payload() failed: %d\n",
        [=](const char *path, const char *device) {
            return install_one_elxcna_payload(context, path, device);
        });
}

int install_one_elxfc_payload(const CMPIContext *context, const char *payloadPath,
                              const char *deviceID) {
    return velk::emulex::install_one(velk::emulex::kFibreChannelService, context, payloadPath,
                                     deviceID);
}

int install_one_elxcna_payload(const CMPIContext *context, const char *payloadPath,
                               const char *deviceID) {
    return velk::emulex::install_one(velk::emulex::kConvergedService, context, payloadPath,
                                     deviceID);
}

void *query_fw_update_emulex(void *block) {
    return velk::adapter::watch_session(block, querysmm_emulex);
}

int querysmm_emulex(int sessionValue) {
    return velk::adapter::poll_session(sessionValue, "SMM :  QuerySMM, QuerySMM start");
}
