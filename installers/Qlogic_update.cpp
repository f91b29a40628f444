#include "installers/Qlogic_update.h"

#include <algorithm>
#include <array>
#include <span>

#include "catalog/applicability.h"
#include "installers/adapter_frame.h"
#include "installers/adapter_service.h"
#include "installers/adapter_session.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk::qlogic {
namespace {

constexpr const char *kNamespace = "qlogic/cimv2";
constexpr const char *kAdapterClass = "QLogic_Adapter_PhysicalPackage";

// How much of the device and payload tables is cleared before each adapter.
constexpr std::size_t kClearedSize = 1024;

constexpr int kPayloadFailed = 1;

// As long as no adapter has been installed, the result stands for "nothing to install".
constexpr int kNothingInstalled = adapter::kUnsupportedTarget;

// clang-format off
constexpr std::array kStatuses = {
    adapter::StatusRow{adapter::kSucceeded,        50, "Package installation successfully."},
    adapter::StatusRow{adapter::kNoObjectPath,     54, "Error when Create Input Parameter and the installation failed."},
    adapter::StatusRow{kNothingInstalled,          57, "No driver file name that need to be update."},
    adapter::StatusRow{adapter::kUriNotAccessible, 55, "The path or file does not exist."},
};
// clang-format on

cim::Instances find_adapters(const CMPIContext *context) {
    return cim::Instances::of(context, cim::make_path(kNamespace, kAdapterClass));
}

// A kind of port controller behind an adapter, and how payloads are installed through it.
struct PortController {
    const char *association;
    const char *class_name;
    const char *found_line;
    const char *instance_line;
    int (*install)(int index, const CMPIContext *context, const CMPIInstance *port_controller);
};

constexpr PortController kNic = {
    .association = "QLogic_NIC_PhysicalPackagePortController",
    .class_name = "QLogic_NIC_PortController",
    .found_line = "Get the QLogic_NIC_PortController Instance from associators.\n",
    .instance_line = "QLogic_NIC_PortController instance found.\n",
    .install = installQlgNICpayload,
};

constexpr PortController kFibreChannel = {
    .association = "QLogic_FCHBA_PhysicalPackagePortController",
    .class_name = "QLogic_FCHBA_PortController",
    .found_line = "Get the QLogic_FCHBA_PortController Instance from associators.\n",
    .instance_line = "QLogic_FCHBA_PortController instance found.\n",
    .install = installQlgFCpayload,
};

enum class Ports { kNull, kNone, kFound };

// Installs through every port controller of that kind; `result` takes the last one's result.
Ports install_through(const PortController &kind, int index, const CMPIContext *context,
                      const CMPIInstance *adapter, int &result) {
    const auto ports = cim::Instances::associated(context, cim::path_of(adapter), kind.association,
                                                  kind.class_name);
    if (!ports.is_valid()) {
        return Ports::kNull;
    }
    Ports found = Ports::kNone;
    for (const CMPIInstance *port : ports) {
        if (found == Ports::kNone) {
            log_entry(kind.found_line);
        }
        found = Ports::kFound;
        log_entry(kind.instance_line);
        result = kind.install(index, context, port);
    }
    return found;
}

// The network function first; the Fibre Channel one only where there is no network function. Where
// that cannot be found out, neither.
void install_adapter(int index, const CMPIContext *context, const CMPIInstance *adapter,
                     int &result) {
    log_entry("Try to get QLogic_NIC_PortController first.\n");
    if (install_through(kNic, index, context, adapter, result) != Ports::kNone) {
        return;
    }
    log_entry("No instance found for QLogic_NIC_PortController.\n");
    log_entry("update qlogic FCHBA.\n");
    if (install_through(kFibreChannel, index, context, adapter, result) == Ports::kNull) {
        log_entry("Association to QLogic_FCHBA_PortController returned NULL.\n");
    }
}

void clear_begin(std::span<std::byte> table) {
    std::fill_n(table.begin(), kClearedSize, std::byte{0});
}

// Makes `adapter` the one that payloads are matched to, at `position` of the device table. Returns
// whether any payload applies to it.
bool match_adapter(int index, int position, const CMPIInstance *adapter) {
    PackageRecord &package = pkgInstance[index];
    clear_begin(std::as_writable_bytes(std::span(package.DFNDeviceIDArray)));
    clear_begin(std::as_writable_bytes(std::span(package.PayloadDeviceIDArray)));
    package.payloadnum = 0;
    const Text<kFieldSize> serial(view(cim::text_of(cim::property(adapter, "SerialNumber"))));
    const adapter::TrimmedDfn dfn("qlogic", cim::text_of(cim::property(adapter, "Model")));
    DfnDevice &device = package.DFNDeviceIDArray[position];
    copy(device.DFN, dfn.view());
    copy(device.DeviceID, view(serial.c_str()));
    match_payloads(index, position, 1);
    return package.payloadnum > 0;
}

int install_adapters(int index, const CMPIContext *context) {
    int result = kNothingInstalled;
    int position = 0;
    const auto adapters = find_adapters(context);
    for (const CMPIInstance *adapter : adapters) {
        if (position == kMaxDevices) {
            break;
        }
        if (!match_adapter(index, position, adapter)) {
            log_entry("No need to update this QLogic Port.\n");
            continue;
        }
        install_adapter(index, context, adapter, result);
        ++position;
    }
    return result;
}

constexpr adapter::AdapterFamily kFamily = {
    .enter_line = "Enter installQlgPkg.\n",
    .discover = getQlgPhysicalAdapterCount,
    .no_adapter_line = "Error: No driver file name that need to be update.\n",
    .no_adapter_message = "No driver file name that need to be update.",
    .unpacked_line = "minizip successfully.\n",
    .watcher = query_fw_update_qlogic,
    .install = install_adapters,
    .removed_line = "util_remove_file successfully.\n",
    .statuses = kStatuses,
};

}  // namespace
}  // namespace velk::qlogic

int installQlgPkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::qlogic::kFamily, idx, context);
}

void getQlgPhysicalAdapterCount(int idx, const CMPIContext *context) {
    if (!velk::is_package_index(idx)) {
        return;
    }
    const auto adapters = velk::qlogic::find_adapters(context);
    int count = 0;
    for ([[maybe_unused]] const CMPIInstance *adapter : adapters) {
        ++count;
    }
    pkgInstance[idx].dfnnumber = count;
}

int installQlgNICpayload(int idx, const CMPIContext *context, const CMPIInstance *portController) {
    velk::log_entry("Enter installQlgNICpayload.\n");
    const int result = velk::adapter::install_payloads(
        idx, "Install Qlogic  %d package. Payload path: %s, Device ID: %s\n",
        "installQlgNICpayload() failed: %d\n", [=](const char *path, const char *) {
            return installSingleQlgNICpayload(context, path, portController);
        });
    return result == 0 ? 0 : velk::qlogic::kPayloadFailed;
}

int installQlgFCpayload(int idx, const CMPIContext *context, const CMPIInstance *portController) {
    velk::log_entry("Enter installQlgFCpayload.\n");
    const int result = velk::adapter::install_payloads(
        idx, "Install %d Qlogic package. Payload path: %s, Device ID: %s\n",
        "installQlgFCpayload() failed: %d\n", [=](const char *path, const char *) {
            return installSingleQlgFCpayload(context, path, portController);
        });
    return result == 0 ? 0 : velk::qlogic::kPayloadFailed;
}

void *query_fw_update_qlogic(void *block) {
    return velk::adapter::watch_session(block, querysmm_qlogic);
}

int querysmm_qlogic(int sessionValue) {
    return velk::adapter::poll_session(sessionValue, "SMM :  QuerySMM, QuerySMM start");
}
