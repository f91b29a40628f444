// ZEB_FileTransferService: brings files to the host and deletes what it brought.
#include "host/providers/file_transfer/fetch_process.h"
#include "host/providers/file_transfer/location.h"
#include "host/providers/file_transfer/transfers.h"
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/local_file.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <system_error>

namespace velkhost::providers {
namespace {

using scenario::Scenario;

constexpr const char *kStore = "/var/tmp/filestore";

// Return values. Those of the transfers are common to both methods; TransferViaURL never ends with
// the first one, as its work begins when it returns.
constexpr std::uint32_t kDone = 0;
constexpr std::uint32_t kFailed = 1;
constexpr std::uint32_t kTimedOut = 2;
constexpr std::uint32_t kInvalid = 3;
constexpr std::uint32_t kNoSpace = 4;
constexpr std::uint32_t kJobStarted = 6;

constexpr std::uint16_t kUsualBlock = 512;
constexpr std::uint16_t kSmallestBlock = 8;
constexpr std::uint16_t kLargestBlock = 65464;

std::uint32_t return_value_of(FetchResult result) {
    switch (result) {
        case FetchResult::kFetched:
            return kDone;
        case FetchResult::kTimedOut:
            return kTimedOut;
        case FetchResult::kInvalid:
            return kInvalid;
        case FetchResult::kNoSpace:
            return kNoSpace;
        default:
            return kFailed;
    }
}

std::uint32_t return_value_of(const std::system_error &error) {
    return error.code() == std::errc::no_space_on_device ? kNoSpace : kFailed;
}

// The output is always there, as callers take one that is missing for a fault of its own.
MethodResult not_transferred(std::uint32_t return_value) {
    return {return_value, {{"DestinationURI", Text("")}}};
}

// What a caller asks for. TransferOptions is taken, but there is nothing to choose.
struct TransferRequest {
    Location location;
    std::uint16_t block_size = kUsualBlock;
};

// No value for what no transfer can be begun with.
std::optional<TransferRequest> read_request(const Args &in,
                                            std::initializer_list<std::string_view> schemes) {
    const auto location = parse_location(in.text("SourceURI"));
    const std::uint16_t block_size = in.uint16_or("BlockSize", kUsualBlock);
    if (!location || block_size < kSmallestBlock || block_size > kLargestBlock ||
        std::ranges::find(schemes, location->scheme) == schemes.end()) {
        return std::nullopt;
    }
    return TransferRequest{*location, block_size};
}

class FileTransferService final : public Provider {
  public:
    [[nodiscard]] const char *class_name() const override { return "ZEB_FileTransferService"; }

    std::vector<Instance> instances() override;
    MethodResult invoke(const Path &target, const std::string &method, const Args &in) override;
    // The ledger and the running transfers would be forgotten.
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    MethodResult transfer_via_tftp(const Args &in);
    MethodResult transfer_via_url(const Args &in);
    MethodResult delete_transferred(const std::string &uri);

    Transfers transfers_{Scenario::current(), kStore, fetcher_beside_this_library()};
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
        return transfer_via_tftp(in);
    }
    if (same_name(method, "TransferViaURL")) {
        return transfer_via_url(in);
    }
    fail_no_method(method);
}

MethodResult FileTransferService::transfer_via_tftp(const Args &in) {
    pass_step("filetransfer.tftp", in.text("SourceURI"));
    const auto request = read_request(in, {"tftp"});
    if (!request) {
        return not_transferred(kInvalid);
    }
    try {
        const TransferAnswer answer = transfers_.fetch(request->location, request->block_size);
        return {return_value_of(answer.outcome.result),
                {{"DestinationURI", Text(answer.destination)}}};
    } catch (const std::system_error &error) {
        return not_transferred(return_value_of(error));
    }
}

MethodResult FileTransferService::transfer_via_url(const Args &in) {
    pass_step("filetransfer.url", in.text("SourceURI"));
    const auto request = read_request(in, {"sftp", "tftp"});
    if (!request) {
        return not_transferred(kInvalid);
    }
    try {
        const StartedTransfer started = transfers_.start(request->location, request->block_size);
        const Reference job{"ZEB_FileTransferJob", {{"InstanceID", Text(started.job_id)}}};
        return {kJobStarted, {{"DestinationURI", Text(started.destination)}, {"Job", job}}};
    } catch (const std::system_error &error) {
        return not_transferred(return_value_of(error));
    }
}

MethodResult FileTransferService::delete_transferred(const std::string &uri) {
    pass_step("filetransfer.delete", uri);
    using Outcome = TransferLedger::Outcome;
    const Outcome outcome = transfers_.ledger().remove(path_of_file_uri(uri).value_or(""));
    if (outcome == Outcome::kNotTransferred) {
        throw CimError(CMPI_RC_ERR_ACCESS_DENIED,
                       "Not deleted, because this service did not transfer it: " + uri);
    }
    if (outcome == Outcome::kFailed) {
        throw CimError(CMPI_RC_ERR_FAILED, "Cannot delete " + uri + ": " + std::strerror(errno));
    }
    return {kDone, {}};
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_FileTransferServiceProvider, velkhost::providers::FileTransferService);
