#include "installers/brocade_update.h"

#include <array>

#include "installers/adapter_frame.h"
#include "installers/adapter_service.h"
#include "installers/adapter_session.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk::brocade {
namespace {

constexpr const char *kNamespace = "root/brocade";
constexpr const char *kServiceClass = "BROCADE_HBASoftwareInstallationService";
constexpr const char *kPortClass = "BROCADE_PortController";
constexpr const char *kSystemClass = "BROCADE_ComputerSystem";

// InstallOptions of CIM_SoftwareInstallationService (DSP1023).
constexpr std::uint16_t kInstall = 4;
constexpr std::uint16_t kUpdate = 5;

// clang-format off
constexpr std::array kStatuses = {
    adapter::StatusRow{adapter::kSucceeded,         50, "Package installation successfully."},
    adapter::StatusRow{adapter::kNoObjectPath,      54, "Error when Create Input Parameter and the installation failed."},
    adapter::StatusRow{adapter::kUnsupportedTarget, 58, "Unsupported Target Type."},
    adapter::StatusRow{adapter::kUriNotAccessible,  55, "The path or file does not exist."},
};
// clang-format on

constexpr adapter::AdapterFamily kFamily = {
    .enter_line = "Enter installBrocadePkg.\n",
    .discover = getBrocadeDFNDeviceIDArray,
    .no_adapter_line = "Error: No driver file name that need to be update.\n",
    .no_adapter_message = "No driver file name that need to be update.\n",
    .unpacked_line = "minizip successfully.\n",
    .unpack_over_line = "minizip finished.\n",
    .matches_payloads = true,
    .before_install_line = "before install the payload.\n",
    .watcher = query_fw_update_brocade,
    .install = installBrcdFCpayload,
    .removed_line = "util_remove_file successfully.\n",
    .statuses = kStatuses,
};

// A text that is missing is not the same as any other.
bool is_same(const char *left, const char *right) {
    return left != nullptr && right != nullptr && view(left) == view(right);
}

// The ports of one physical package. `port` goes on where the last walk stopped: at the end.
void add_ports(PackageRecord &package, const CMPIInstance *physical_package,
               cim::Instances::Iterator &port) {
    const adapter::TrimmedDfn dfn("Brocade",
                                  cim::text_of(cim::property(physical_package, "Model")));
    const char *serial = cim::text_of(cim::property(physical_package, "SerialNumber"));
    log_format("SerialNumber is %s\n", adapter::text_or_empty(serial));
    for (; port != cim::Instances::end(); ++port) {
        const char *name = cim::text_of(cim::property(*port, "Name"));
        log_format("PortName is %s\n", adapter::text_or_empty(name));
        if (!is_same(name, serial)) {
            continue;
        }
        log_entry("find the supported deviceid.");
        const char *device = cim::text_of(cim::property(*port, "DeviceID"));
        log_format("Port DeviceId is %s\n", adapter::text_or_empty(device));
        adapter::add_device(package, dfn.view(), view(device));
    }
}

cim::Path make_service(const CMPIContext *context, adapter::SystemName &system) {
    cim::Path service = cim::make_path(kNamespace, kServiceClass);
    system.find(context, service,
                [](const char *name) { log_untimed("Brocade SystemName =", name); });
    cim::add_key(service, "CreationClassName", kServiceClass);
    cim::add_key(service, "SystemName", system.get());
    cim::add_key(service, "Name", "Brocade Adapter Software Update Service");
    cim::add_key(service, "SystemCreationClassName", kSystemClass);
    return service;
}

// One element and two settings: the second is the broker's to refuse, and the array carries the
// first.
void add_install_options(const cim::Args &in) {
    log_entry("+++passing IN InstallOptions argument - type uint16[].\n");
    const cim::Array options = cim::make_uint16_array(1);
    log_entry("+++Setting InstallOptions element - Update.");
    cim::set_element(options, 0, kInstall);
    cim::set_element(options, 1, kUpdate);
    log_entry("+++Adding InstallOptions to argument array.\n");
    cim::add_uint16_array(in, "InstallOptions", options);
}

cim::Path make_target(const adapter::SystemName &system, const char *device) {
    log_entry("+++passing IN Target argument - type ref.\n");
    cim::Path target = cim::make_path(kNamespace, kPortClass);
    cim::add_key(target, "SystemCreationClassName", kSystemClass);
    cim::add_key(target, "SystemName", system.get());
    cim::add_key(target, "CreationClassName", kPortClass);
    cim::add_key(target, "DeviceID", device);
    log_entry(target ? "Create BROCADE_PortController sucessfully.\n"
                     : "Create OMC_UnitaryComputerSystem failed.\n");
    return target;
}

}  // namespace
}  // namespace velk::brocade

int installBrocadePkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::brocade::kFamily, idx, context);
}

void getBrocadeDFNDeviceIDArray(int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter getBrocadeDFNDeviceIDArray.\n");
    if (!is_package_index(idx)) {
        return;
    }
    PackageRecord &package = pkgInstance[idx];
    package.dfnnumber = 0;
    const auto packages =
        cim::Instances::of(context, cim::make_path(brocade::kNamespace, "BROCADE_PhysicalPackage"));
    const auto ports =
        cim::Instances::of(context, cim::make_path(brocade::kNamespace, brocade::kPortClass));
    auto port = ports.begin();
    for (const CMPIInstance *physical_package : packages) {
        brocade::add_ports(package, physical_package, port);
    }
}

int installBrcdFCpayload(int idx, const CMPIContext *context) {
    return velk::adapter::install_payloads(
        idx, "Install Brocade %d package. Payload path: %s, Device ID: %s\n", nullptr,
        [=](const char *path, const char *device) {
            return installSingleBrcdFCpayload(context, path, device);
        });
}

int installSingleBrcdFCpayload(const CMPIContext *context, const char *payloadPath,
                               const char *deviceID) {
    using namespace velk;
    log_entry("Enter installSingleBrcdFCpayload.\n");
    adapter::SystemName system;
    const cim::Path service = brocade::make_service(context, system);
    if (!service) {
        return adapter::kNoObjectPath;
    }
    log_entry("Create BROCADE_HBASoftwareInstallationService successfully.\n");
    const cim::Args in = cim::make_args();
    const cim::Args out = cim::make_args();
    brocade::add_install_options(in);
    const cim::Path target = brocade::make_target(system, deviceID);
    if (!target) {
        return adapter::kNoObjectPath;
    }
    cim::add_reference(in.get(), "Target", target.get());
    const adapter::PayloadUri uri = adapter::payload_uri(payloadPath);
    cim::add_text(in, "URI", uri.c_str());
    log_value("To install package...", view(uri.c_str()));
    log_entry("Invoking InstallFromByteStream Method and updating flash image. Please wait...\n");
    const cim::Call call = cim::invoke(context, service, "InstallFromURI", in, out);
    log_format("CBInvokeMethod Retcode:%d\n", call.value);
    if (call.status.rc != CMPI_RC_OK) {
        log_value("Package installation error message:", cim::message_of(call.status));
        return adapter::kCallFailed;
    }
    return call.value;
}

void *query_fw_update_brocade(void *block) {
    return velk::adapter::watch_session(block, querysmm_brocade);
}

int querysmm_brocade(int sessionValue) {
    return velk::adapter::poll_session(sessionValue,
                                       "SMM :  querysmm_brocade, querysmm_brocade start");
}
