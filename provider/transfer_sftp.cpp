#include <unistd.h>

#include "provider/transfer.h"
#include "provider/transfer_call.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/status_report.h"

namespace velk::transfer {
namespace {

constexpr std::uint16_t kOption = 1;
constexpr int kTransferStarted = 6;
constexpr unsigned kPollSeconds = 10;
constexpr int kAttempts = 3;

// CIM_ConcreteJob.JobState (DSP1103).
constexpr int kJobRunning = 4;
constexpr int kJobCompleted = 7;

struct JobLook {
    bool has_status;
    int state;
};

JobLook look_at(const CMPIContext *context, const cim::Path &job) {
    log_entry("Enter GetSFTPJob Status.\n");
    const cim::Instance instance = cim::get_instance(context, job);
    const char *status = cim::text_of(cim::property(instance.get(), "JobStatus"));
    const int state = cim::int_of(cim::property(instance.get(), "JobState"));
    log_format("jobstatus is %s\n", status == nullptr ? "" : status);
    log_format("JobState is %d\n", state);
    return {status != nullptr, state};
}

bool fail(int index) {
    update_Pkg_Install_status(index, status_code::kDownloadFailed, "Package download failed.");
    return false;
}

// Follows the transfer job to its end; returns whether the file was fetched. There is no limit of
// time as long as the job is running, and the attempts for a job that cannot be read are counted
// over all of it.
bool follow_job(int index, const CMPIContext *context, const cim::Path &job) {
    int attempts = kAttempts;
    int elapsed = 0;
    while (true) {
        const JobLook look = look_at(context, job);
        if (!look.has_status) {
            if (--attempts == 0) {
                return fail(index);
            }
            sleep(kPollSeconds);
            continue;
        }
        if (look.state == kJobCompleted) {
            update_Pkg_Install_status(
                index, status_code::kDownloaded,
                "Package download completed and the update process is running.");
            return true;
        }
        if (look.state != kJobRunning) {
            return fail(index);
        }
        update_Pkg_Install_status(index, status_code::kTransferring,
                                  "Package download is running and the update process is running.");
        sleep(kPollSeconds);
        elapsed += static_cast<int>(kPollSeconds);
        log_value("Transfer file var sftp time elapses ", elapsed);
    }
}

}  // namespace
}  // namespace velk::transfer

int downloadFileViaSFTP(const char *sourceURI, int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter downloadFileViaSFTP.\n");
    if (!is_package_index(idx)) {
        return 0;
    }
    transfer::TransferCall call(
        "fail to get object path from zeb/cimv2:ZEB_FileTransferService .\n", sourceURI,
        transfer::kOption);
    const int return_value = call.invoke(context, "TransferViaURL");
    log_format("retCode: %d\n", return_value);
    const cim::Path job = call.job();
    sleep(transfer::kPollSeconds);
    bool fetched = false;
    if (call.has_service() && return_value == transfer::kTransferStarted) {
        fetched = transfer::follow_job(idx, context, job);
    } else {
        transfer::reject(idx, status_code::kTransferUnknownError,
                         "Unknown Error when package downloading");
    }
    const bool stored =
        call.store_destination(idx, "Invalid Destination URI from SFTP file transfer");
    log_entry("Complete downloadFileViaSFTP.\n");
    return fetched && stored ? 1 : 0;
}
