#include <algorithm>
#include <array>

#include "provider/transfer.h"
#include "provider/transfer_call.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/status_report.h"

namespace velk::transfer {
namespace {

constexpr std::uint16_t kOption = 0;

// What the service's return value means for the package.
struct Outcome {
    int return_value;
    int code;
    const char *message;
    bool fetched;
};

// clang-format off
constexpr std::array kOutcomes = {
    Outcome{0, 10, "Package download completed and the update process is running.", true},
    Outcome{1, 11, "Package download failed.",                                      false},
    Outcome{2, 12, "TFTP file transfer timeout.",                                   false},
    Outcome{3, 13, "Invalid input parameter in TFTP file transfer.",                false},
    Outcome{4, 14, "Not enough space on VMWare ESXi storage.",                      false},
    Outcome{5, 15, "Asynchronous TFTP transfer",                                    true},
};
// clang-format on

constexpr Outcome kUnknown = {-1, status_code::kTransferUnknownError,
                              "Unknown Error when package downloading", false};
constexpr Outcome kNoService = {-1, status_code::kTransferError,
                                "Package download error message: Create CMPIObjectPath failed.",
                                false};

Outcome outcome_of(const TransferCall &call, int return_value) {
    if (!call.has_service()) {
        return kNoService;
    }
    const auto *row = std::find_if(
        kOutcomes.begin(), kOutcomes.end(),
        [=](const Outcome &candidate) { return candidate.return_value == return_value; });
    return row == kOutcomes.end() ? kUnknown : *row;
}

void report(int index, const Outcome &outcome) {
    if (outcome.fetched) {
        update_Pkg_Install_status(index, outcome.code, outcome.message);
    } else {
        reject(index, outcome.code, outcome.message);
    }
}

}  // namespace
}  // namespace velk::transfer

int downloadFileViaTFTP(const char *sourceURI, int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter downloadFileViaTFTP.\n");
    if (!is_package_index(idx)) {
        return 0;
    }
    transfer::TransferCall call("fail to get object path from zeb/cimv2:ZEB_FileTransferService.\n",
                                sourceURI, transfer::kOption);
    const int return_value = call.invoke(context, "TransferViaTFTP");
    log_value("retCode: ", return_value);
    const transfer::Outcome outcome = transfer::outcome_of(call, return_value);
    transfer::report(idx, outcome);
    const bool stored =
        call.store_destination(idx, "Invalid Destination URI from TFTP file transfer");
    log_entry("Complete downloadFileViaTFTP.");
    return outcome.fetched && stored ? 1 : 0;
}
