#include "installers/ESW_job_status.h"

#include <algorithm>
#include <array>

#include "velk/status_report.h"

namespace velk::esw {
namespace {

using namespace status_code;

// First-failure data is waiting on the controller for these detail codes.
constexpr int kFirstFailureData = 0x10;
constexpr int kLastFailureData = 0x42;

struct Row {
    std::string_view job_text;
    Verdict verdict;
};

// clang-format off
constexpr std::array kVocabulary = {
    Row{"Initialization",
        {kInstalling, "Initialization and Package installation is running.", Verdict::kWait}},
    Row{"Transfering file to RXC",
        {kInstalling, "Transfering file to RXC and Package installation is running.", Verdict::kWait}},
    Row{"updating firmware",
        {kInstalling, "Updating and Package installation is running.", Verdict::kWait}},
    Row{"RXC rebooting",
        {kInstalling, "RXC rebooting and Package installation is running.", Verdict::kWait}},
    Row{"Process Completed",
        {kInstalled, "Package installation successfully.", Verdict::kInstalled}},
    Row{"Completed, need restart system to active FPGA.",
        {kInstalled, "Package installation successfully and need restart system to active FPGA.", Verdict::kInstalled}},
    Row{"Unable to ping through RXC IP address",
        {kControllerFailure, "Unable to ping through RXC IP address.", Verdict::kFailed}},
    Row{"Unable to connect RXC through IPMI over KCS",
        {kControllerFailure, "Unable to connect RXC through IPMI over KCS.", Verdict::kFailed}},
    Row{"Get active lock failed",
        {kControllerFailure, "Get active lock failed.", Verdict::kFailed}},
};
// clang-format on

constexpr Verdict kError = {kInstallError, "Package installation error happened.",
                            Verdict::kFailed};
constexpr Verdict kFailureData = {kControllerFailure, "Need download FFDC File from ESXi.",
                                  Verdict::kFailed};

}  // namespace

Verdict judge(int detail, std::string_view text) {
    if (detail >= kFirstFailureData && detail <= kLastFailureData) {
        return kFailureData;
    }
    const auto *row = std::find_if(kVocabulary.begin(), kVocabulary.end(),
                                   [&](const Row &known) { return known.job_text == text; });
    return row == kVocabulary.end() ? kError : row->verdict;
}

Verdict no_status() {
    return kError;
}

}  // namespace velk::esw
