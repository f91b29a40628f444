#include "provider/install_driver.h"

#include <fcntl.h>

#include "catalog/classification.h"
#include "catalog/descriptor.h"
#include "provider/fetch.h"
#include "provider/maintenance.h"
#include "provider/ordering.h"
#include "provider/work_area.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"
#include "velk/package_table.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace velk {
namespace {

// The result of a request in which no package came to its installer.
constexpr int kNothingDeployed = 1;

void create_lock_marker() {
    const FileDescriptor marker(kLockMarker, O_WRONLY | O_CREAT | O_APPEND);
    if (marker.is_open()) {
        log_entry("Successfully create safe lock file !\n");
    }
}

void read_descriptor(int index, const CMPIContext *context) {
    const PackageRecord &package = pkgInstance[index];
    if (GetFileFromLocalOrTFTP(package.TFTPXMLPkgURIs, index, context) != 0) {
        getPkgAssociation(index);
        deleteTransferedFile(package.LocalPkgURI, context);
    }
}

void delete_payload(const PackageRecord &package, const CMPIContext *context) {
    debug("\n");
    log_value("prepare to delete the bin file.", view(package.LocalPkgURI));
    deleteTransferedFile(package.LocalPkgURI, context);
}

// Passes the package by or installs it; `result` takes the installer's result.
void install_package(int index, const CMPIContext *context, int &result) {
    const PackageRecord &package = pkgInstance[index];
    if (package.OrderFlag == order_flag::kRejected) {
        return;
    }
    if (package.OrderFlag == order_flag::kUnsupportedType) {
        update_Pkg_Install_status(index, status_code::kNotSupported,
                                  "This package is not supported by current VELK provider.");
        return;
    }
    // A hypervisor bundle is fetched and removed by its installer.
    const bool has_payload = view(package.category) != "Embedded Hypervisor";
    if (has_payload && GetFileFromLocalOrTFTP(package.TFTPPayloadPkgURIs, index, context) == 0) {
        return;
    }
    result = DeployUpdate(index, context);
    if (has_payload) {
        delete_payload(package, context);
    }
}

}  // namespace
}  // namespace velk

int syncInstallAllPkgs(const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter syncInstallAllPkgs.\n");
    cim::make_args().reset();  // asked for and discarded, as brokers have always seen it
    create_lock_marker();
    for (int i = 0; i < package_count(); ++i) {
        read_descriptor(i, context);
    }
    OrderPkgInstallation();
    int result = kNothingDeployed;
    for (int i = 0; i < package_count(); ++i) {
        install_package(PkgSeq[i], context, result);
    }
    log_entry("Complete InstallAllPkgs.\n");
    if (load(invoke_client) == kUpdateManager) {
        reset_cimmon();
    }
    return result;
}
