#include "installers/ESW_job_status.h"

#include <array>

namespace velk::esw {
namespace {

using namespace status_code;

// First-failure data is waiting on the controller for these detail codes.
constexpr int kFirstFailureData = 0x10;
constexpr int kLastFailureData = 0x42;

// clang-format off
constexpr std::array kVocabulary = {
    VocabularyRow{"Initialization",
        {kInstalling, "Initialization and Package installation is running.", Verdict::kWait}},
    VocabularyRow{"Transfering file to RXC",
        {kInstalling, "Transfering file to RXC and Package installation is running.", Verdict::kWait}},
    VocabularyRow{"updating firmware",
        {kInstalling, "Updating and Package installation is running.", Verdict::kWait}},
    VocabularyRow{"RXC rebooting",
        {kInstalling, "RXC rebooting and Package installation is running.", Verdict::kWait}},
    VocabularyRow{"Process Completed",
        {kInstalled, "Package installation successfully.", Verdict::kInstalled}},
    VocabularyRow{"Completed, need restart system to active FPGA.",
        {kInstalled, "Package installation successfully and need restart system to active FPGA.", Verdict::kInstalled}},
    VocabularyRow{"Unable to ping through RXC IP address",
        {kControllerFailure, "Unable to ping through RXC IP address.", Verdict::kFailed}},
    VocabularyRow{"Unable to connect RXC through IPMI over KCS",
        {kControllerFailure, "Unable to connect RXC through IPMI over KCS.", Verdict::kFailed}},
    VocabularyRow{"Get active lock failed",
        {kControllerFailure, "Get active lock failed.", Verdict::kFailed}},
};
// clang-format on

constexpr Verdict kFailureData = {kControllerFailure, "Need download FFDC File from ESXi.",
                                  Verdict::kFailed};

}  // namespace

Verdict judge(int detail, std::string_view text) {
    if (detail >= kFirstFailureData && detail <= kLastFailureData) {
        return kFailureData;
    }
    return velk::judge(kVocabulary, text);
}

}  // namespace velk::esw
