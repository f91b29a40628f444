// ZEB_FileTransferService: brings files to the host and deletes what it brought.
#include "host/providers/file_transfer/transfer_ledger.h"
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/local_file.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

#include <cerrno>
#include <cstring>

namespace velkhost::providers {
namespace {

using scenario::Scenario;

constexpr std::uint32_t kDone = 0;

class FileTransferService final : public Provider {
  public:
    FileTransferService() : ledger_(Scenario::current()->file_transfer.transferred) {}

    [[nodiscard]] const char *class_name() const override { return "ZEB_FileTransferService"; }

    std::vector<Instance> instances() override;
    MethodResult invoke(const Path &target, const std::string &method, const Args &in) override;
    // The ledger would be forgotten.
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    MethodResult delete_transferred(const std::string &uri);
    [[noreturn]] static void transfer(const char *step, const std::string &uri);

    TransferLedger ledger_;
};

std::vector<Instance> FileTransferService::instances() {
    return {{{{"SystemCreationClassName", Text("ZEB_ManagementController")},
              {"SystemName", Text("ManagementController")},
              {"CreationClassName", Text("ZEB_FileTransferService")},
              {"Name", Text("HostFileTransferService")}},
             {{"ElementName", Text("File transfer to this host")}}}};
}

// Callers name the class alone; a path with keys must name the one service that there is.
MethodResult FileTransferService::invoke(const Path &target, const std::string &method,
                                         const Args &in) {
    if (target.key_count() > 0) {
        read(target);
    }
    if (same_name(method, "DeleteTransferredFile")) {
        return delete_transferred(in.text("FileURI"));
    }
    if (same_name(method, "TransferViaTFTP")) {
        transfer("filetransfer.tftp", in.text("SourceURI"));
    }
    if (same_name(method, "TransferViaURL")) {
        transfer("filetransfer.url", in.text("SourceURI"));
    }
    fail_no_method(method);
}

MethodResult FileTransferService::delete_transferred(const std::string &uri) {
    pass_step("filetransfer.delete", uri);
    using Outcome = TransferLedger::Outcome;
    const Outcome outcome = ledger_.remove(path_of_file_uri(uri).value_or(""));
    if (outcome == Outcome::kNotTransferred) {
        throw CimError(CMPI_RC_ERR_ACCESS_DENIED,
                       "Not deleted, because this service did not transfer it: " + uri);
    }
    if (outcome == Outcome::kFailed) {
        throw CimError(CMPI_RC_ERR_FAILED, "Cannot delete " + uri + ": " + std::strerror(errno));
    }
    return {kDone, {}};
}

void FileTransferService::transfer(const char *step, const std::string &uri) {
    pass_step(step, uri);
    throw CimError(CMPI_RC_ERR_NOT_SUPPORTED,
                   "This host's file transfer service does not fetch files: " + uri);
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_FileTransferServiceProvider, velkhost::providers::FileTransferService);
