// How an update of the hypervisor goes, in the words of its provider.
#pragma once

#include "host/scenario/model.h"

#include <string>
#include <vector>

namespace velkhost::providers::texts {

// clang-format off
inline constexpr const char *kScanning  = "Scanning URI for installable packages";
inline constexpr const char *kUpdating  = "Scan of URI Complete and installable packages found. Starting Update.";
inline constexpr const char *kCompleted = "The update completed successfully, but the system needs to be rebooted for the changes to be effective.";
inline constexpr const char *kObsolete  = "Updates at supplied URI are obsolete or already installed";
inline constexpr const char *kFailed    = "The update failed: ";  // and why
// clang-format on

}  // namespace velkhost::providers::texts

namespace velkhost::providers {

std::vector<scenario::JobLook> completed_course();
std::vector<scenario::JobLook> obsolete_course();
std::vector<scenario::JobLook> failed_course(const std::string &reason);

}  // namespace velkhost::providers
