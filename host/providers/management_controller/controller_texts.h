// What the management controller says in JobStatus: a hexadecimal code, '|', a text. Codes 0x10 to
// 0x42 mean that the controller holds diagnostic data (FFDC) to collect, whatever the text says.
#pragma once

#include "host/scenario/model.h"

#include <string>
#include <vector>

namespace velkhost::providers::texts {

// clang-format off
inline constexpr const char *kInitialization = "0x00|Initialization";
inline constexpr const char *kTransferring   = "0x01|Transfering file to RXC";
inline constexpr const char *kUpdating       = "0x02|updating firmware";
inline constexpr const char *kRebooting      = "0x03|RXC rebooting";
inline constexpr const char *kCompleted      = "0x04|Process Completed";
inline constexpr const char *kFpgaCompleted  = "0x05|Completed, need restart system to active FPGA.";
inline constexpr const char *kNoPing         = "0x43|Unable to ping through RXC IP address";
inline constexpr const char *kNoIpmi         = "0x44|Unable to connect RXC through IPMI over KCS";
inline constexpr const char *kNoLock         = "0x45|Get active lock failed";
// clang-format on

}  // namespace velkhost::providers::texts

namespace velkhost::providers {

// How an update of the firmware at `uri` goes when all is well. `reboots`: the controller was
// asked to restart afterwards. FPGA firmware, told by its file's name, wants the host restarted.
std::vector<scenario::JobLook> usual_job(const std::string &uri, bool reboots);

}  // namespace velkhost::providers
