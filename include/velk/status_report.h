// How a stage tells what became of a package.
#pragma once

#include "velk/api.h"

// The codes of the status line.
namespace velk::status_code {
inline constexpr int kInitialized = 0;
inline constexpr int kDownloaded = 10;
inline constexpr int kDownloadFailed = 11;
inline constexpr int kDescriptorUnreadable = 12;
inline constexpr int kTransferring = 15;
inline constexpr int kTransferError = 16;
inline constexpr int kTransferUnknownError = 17;
inline constexpr int kInvalidDestination = 18;
inline constexpr int kInstalled = 50;
inline constexpr int kControllerFailure = 53;
inline constexpr int kNotStarted = 56;
inline constexpr int kInstallError = 57;
inline constexpr int kNothingToUpdate = 59;
inline constexpr int kScanning = 60;
inline constexpr int kUpdating = 61;
inline constexpr int kInstalling = 62;
inline constexpr int kNotSupported = 80;
}  // namespace velk::status_code

// Keeps `value` as the overall status of the request.
VELK_API void set_totalstatus(int value);

// Records the state of package `idx`: rewrites its `installResult`, then, for an asynchronous
// request, the job's status file, then the overall status. `message` is taken unchanged; the
// result line is cut at 199 characters, the status line at 1023. An index outside the table does
// nothing. Returns 0.
VELK_API int update_Pkg_Install_status(int idx, int code, const char *message);

// Called by the job library. Reads the status line of the job `instance_id` ("VELK-7") into
// `message` (`message_size` bytes, always terminated) and derives the CIM job state from it:
// 7 completed, 4 running, 10 exception (DSP1103). Without a readable line both stay as they are.
// Returns 0.
VELK_API int getVELKStatus(const char *instance_id, int *job_state, char *message,
                           int message_size);

// Called by the job library when the job is removed. Returns 1 when the job's status file was
// removed, else 0.
VELK_API int VELKStatusCleanup(const char *instance_id);
