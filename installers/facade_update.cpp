#include "installers/facade_update.h"

#include <unistd.h>

#include <array>

#include "installers/adapter_frame.h"
#include "installers/adapter_session.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk::facade {
namespace {

constexpr unsigned kPollSeconds = 10;

// The Broadcom service's CheckStatus.
constexpr int kUpdateRunning = 1;
constexpr int kStatusUnknown = -1;  // our own: it told none, which must not pass for a success

// The LSI service's own return values.
constexpr int kLevelCurrent = 12;
constexpr int kNotApplicable = 13;

// clang-format off
constexpr std::array kBroadcomStatuses = {
    adapter::StatusRow{adapter::kSucceeded,         50, "Package installation successfully."},
    adapter::StatusRow{adapter::kNoObjectPath,      adapter::kNoReport, ""},
    adapter::StatusRow{adapter::kUnsupportedTarget, 58, "Unsupported Target Type."},
    adapter::StatusRow{adapter::kUriNotAccessible,  55, "The path or file does not exist."},
};

constexpr std::array kLsiStatuses = {
    adapter::StatusRow{adapter::kSucceeded,         50, "Package installation successfully."},
    adapter::StatusRow{adapter::kNoObjectPath,      54, "Error when Create Input Parameter and the installation failed."},
    adapter::StatusRow{kLevelCurrent,               55, "Current firmware level is equal or better for one or more controllers."},
    adapter::StatusRow{kNotApplicable,              55, "Package is not applicable for the selected LSI Controllers."},
    adapter::StatusRow{adapter::kUnsupportedTarget, 58, "Unsupported Target Type."},
    adapter::StatusRow{adapter::kUriNotAccessible,  55, "The path or file does not exist."},
};
// clang-format on

int install_broadcom(int index, const CMPIContext *context) {
    return installBroadcompayload(index, context, adapter::kUnpackDirectory);
}

int install_lsi(int index, const CMPIContext *context) {
    return installLSIpayload(index, context, adapter::kUnpackDirectory);
}

constexpr adapter::AdapterFamily kBroadcom = {
    .enter_line = "Enter installBroadcomPkg.\n",
    .unpacked_line = "minizip successfully.\n",
    .before_install_line = "before install the payload.\n",
    .watcher = query_fw_update_facade,
    .install = install_broadcom,
    .installed_line = "installBroadcompayload finished,need to delete the unzipped first.\n",
    .unlisted_result_line = "installBroadcompayload finished,need to delete the unzipped files.\n",
    .statuses = kBroadcomStatuses,
    .exit_line = "InstallBroadcomPkg Completed.\n",
};

constexpr adapter::AdapterFamily kLsi = {
    .enter_line = "--> installLSIPkg.\n",
    .unpacked_line = "minizip successfully.\n",
    .before_install_line = "before install the payload.\n",
    .watcher = query_fw_update_facade,
    .install = install_lsi,
    .statuses = kLsiStatuses,
    .exit_line = "<-- installLSIPkg.\n",
};

// A vendor's service, of which there is exactly one with fixed keys.
struct Service {
    const char *name_space;
    const char *class_name;
    const char *system_class;
    const char *name;
    const char *created_line;
};

constexpr Service kBroadcomService = {
    .name_space = "brcmfwup/cimv2",
    .class_name = "BRCMFWUP_SoftwareInstallationService",
    .system_class = "BRCMFWUP Provider",
    .name = "BRCMFWUPSoftwareInstallationService",
    .created_line = "Create BRCMFWUP_SoftwareInstallationService successfully.\n",
};

constexpr Service kLsiService = {
    .name_space = "tavu/cimv2",
    .class_name = "TAVU_SoftwareInstallationService",
    .system_class = "TAVU Provider",
    .name = "TAVUSoftwareInstallationService",
    .created_line = "Create TAVU_SoftwareInstallationService successfully.\n",
};

cim::Path make_service(const Service &service) {
    cim::Path path = cim::make_path(service.name_space, service.class_name);
    cim::add_key(path, "SystemCreationClassName", service.system_class);
    cim::add_key(path, "SystemName", "Management Controller");
    cim::add_key(path, "Name", service.name);
    cim::add_key(path, "CreationClassName", service.class_name);
    if (path) {
        log_entry(service.created_line);
    }
    return path;
}

// Calls InstallFromURI with the directory as it is, no "file://" before it, and the option unless
// it is null.
cim::Call install_directory(const CMPIContext *context, const cim::Path &service,
                            const char *directory, const char *facade_option) {
    const cim::Args in = cim::make_args();
    const cim::Args out = cim::make_args();
    cim::add_text(in, "URI", directory);
    if (facade_option != nullptr) {
        cim::add_text(in, "FacadeOption", facade_option);
    }
    log_value("To install package...", view(directory));
    log_entry("Invoking InstallFromURI Method and updating flash image. Please wait...\n");
    const cim::Call call = cim::invoke(context, service, "InstallFromURI", in, out);
    log_format("CBInvokeMethod Retcode:%d\n", call.value);
    return call;
}

int fail_call(const CMPIStatus &status) {
    log_value("Package installation error message:", cim::message_of(status));
    return adapter::kCallFailed;
}

int check_status(const CMPIContext *context, const cim::Path &service) {
    const cim::Args in = cim::make_args();
    const cim::Args out = cim::make_args();
    cim::add_text(in, "ID", "0");
    log_entry("Enter GetBRCMJob Status.\n");
    const cim::Call call = cim::invoke(context, service, "CheckStatus", in, out);
    log_format("CheckStatus Retcode:%d\n", call.value);
    const int status = cim::int_of(cim::argument(out.get(), "status"), kStatusUnknown);
    log_format("CheckStatus status is :%d\n", status);
    return status;
}

int follow_broadcom_update(const CMPIContext *context, const cim::Path &service) {
    int elapsed = 0;
    while (true) {
        const int status = check_status(context, service);
        if (status != kUpdateRunning) {
            return status;
        }
        sleep(kPollSeconds);
        elapsed += static_cast<int>(kPollSeconds);
        log_value("update brcm time elapses ", elapsed);
    }
}

}  // namespace
}  // namespace velk::facade

int installBroadcomPkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::facade::kBroadcom, idx, context);
}

int installLSIPkg(int idx, const CMPIContext *context) {
    return velk::adapter::install_package(velk::facade::kLsi, idx, context);
}

int installBroadcompayload(int, const CMPIContext *context, const char *directory) {
    velk::log_entry("Enter installBroadcompayload.\n");
    return installSingleBroadcompayload(context, directory);
}

int installLSIpayload(int, const CMPIContext *context, const char *directory) {
    velk::log_entry("--> installLSIpayload.\n");
    return installSingleLSIpayload(context, directory);
}

int installSingleBroadcompayload(const CMPIContext *context, const char *directory) {
    using namespace velk;
    log_entry("Enter installSingleBroadcompayload.\n");
    const cim::Path service = facade::make_service(facade::kBroadcomService);
    if (!service) {
        return adapter::kNoObjectPath;
    }
    const cim::Call call = facade::install_directory(context, service, directory, "asyn");
    if (call.status.rc != CMPI_RC_OK || call.value != adapter::kJobStarted) {
        return facade::fail_call(call.status);
    }
    return facade::follow_broadcom_update(context, service);
}

int installSingleLSIpayload(const CMPIContext *context, const char *directory) {
    using namespace velk;
    log_entry("--> installSingleLSIpayload.\n");
    const cim::Path service = facade::make_service(facade::kLsiService);
    if (!service) {
        return adapter::kNoObjectPath;
    }
    const cim::Call call = facade::install_directory(context, service, directory, nullptr);
    return call.status.rc == CMPI_RC_OK ? call.value : facade::fail_call(call.status);
}

void *query_fw_update_facade(void *block) {
    return velk::adapter::watch_session(block, querysmm_facade);
}

int querysmm_facade(int sessionValue) {
    return velk::adapter::poll_session(sessionValue, "SMM :  QuerySMM, QuerySMM start");
}
