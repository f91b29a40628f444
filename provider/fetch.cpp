#include "provider/fetch.h"

#include "provider/transfer.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/request_state.h"

namespace velk {
namespace {

// An FTP location stands for a hypervisor bundle, which its own installer fetches. It is the first
// package that is marked, whichever was asked for.
void mark_hypervisor_bundle() {
    copy(pkgInstance[0].category, "Embedded Hypervisor");
    copy(pkgInstance[0].Name, "VMware");
}

}  // namespace
}  // namespace velk

int GetFileFromLocalOrTFTP(const char *sourceURI, int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter GetFileFromLocalOrTFTP.\n");
    log_format("%s\n", sourceURI == nullptr ? "" : sourceURI);
    if (!is_package_index(idx)) {
        return 0;
    }
    switch (filelocation) {
        case kLocal:
            copy(pkgInstance[idx].LocalPkgURI, view(sourceURI));
            return 1;
        case kTftp:
            return downloadFileViaTFTP(sourceURI, idx, context);
        case kSftp:
            log_entry("Enter FileLocationSFTP\n");
            return downloadFileViaSFTP(sourceURI, idx, context);
        case kFtp:
            mark_hypervisor_bundle();
            return 0;
        default:
            return filelocation;
    }
}

void deleteTransferedFile(const char *fileURI, const CMPIContext *context) {
    using namespace velk;
    const cim::Path service = cim::make_path("zeb/cimv2", "ZEB_FileTransferService");
    if (!service) {
        log_entry("Can't create deleteTransferedFile object.\n");
    }
    const cim::Args in = cim::make_args();
    cim::add_text(in, "FileURI", fileURI);
    const cim::Args out = cim::make_args();
    log_value("Delete file ", view(fileURI));
    const cim::Call call = cim::invoke(context, service, "DeleteTransferredFile", in, out);
    if (call.status.rc == CMPI_RC_OK) {
        log_entry("Complete deleteTransferedFile.\n");
        return;
    }
    log_entry("deleteTransferedFile failed.\n");
    log_value("Error message:", cim::message_of(call.status));
}
