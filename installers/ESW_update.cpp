#include "installers/ESW_update.h"

#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <string_view>
#include <utility>

#include "installers/ESW_job_status.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace velk::esw {
namespace {

constexpr int kSucceeded = 0;
constexpr int kFailed = 1;

// CIM_SoftwareInstallationService.InstallFromURI(): parameters checked, job started.
constexpr int kJobStarted = 4096;

constexpr unsigned kPollSeconds = 10;
constexpr int kRetryBudget = 3;
constexpr std::size_t kMessageSize = 1024;

cim::Path make_service_path() {
    cim::Path path = cim::make_path("zeb/cimv2", "ZEB_SoftwareInstallationService");
    cim::add_key(path, "SystemCreationClassName", "ZEB_ManagementController");
    cim::add_key(path, "SystemName", "ManagementController");
    cim::add_key(path, "CreationClassName", "ZEB_SoftwareInstallationService");
    cim::add_key(path, "Name", "RXCSoftwareInstallatiIonService");
    return path;
}

cim::Args make_install_arguments(const PackageRecord &package) {
    cim::Args in = cim::make_args();
    cim::add_text(in, "URI", package.LocalPkgURI);
    const bool backup = load(g_is_backup_update) == 1;
    log_entry(backup ? "This update is for backup bank.\n" : "This update is for primary bank.\n");
    cim::add_uint8(in, "Update_Operation", backup ? 1 : 0);
    const bool reboot = load(g_is_noreboot_update) != 1;
    log_entry(reboot ? "This update with rxc reboot" : "This update with no rxc reboot");
    cim::add_uint8(in, "reboot_option", reboot ? 1 : 0);
    return in;
}

struct Start {
    bool succeeded;
    cim::Path job;  // null where the service named none: a job that then never shows a status
};

// Asks the service to install; a failure has been reported on return.
Start start_job(int index, const CMPIContext *context, cim::Path service) {
    const cim::Args in = make_install_arguments(pkgInstance[index]);
    const cim::Args out = cim::make_args();
    log_value("To install package...", view(pkgInstance[index].LocalPkgURI));
    const cim::Call call = cim::invoke(context, service, "InstallFromURI", in, out);
    log_value("retCode: ", call.value);
    service.reset();
    cim::Path job = cim::clone_reference(cim::argument(out.get(), "Job"));
    sleep(kPollSeconds);
    if (call.status.rc != CMPI_RC_OK || call.value != kJobStarted) {
        report_not_started(index, call.status);
        return {false, nullptr};
    }
    return {true, std::move(job)};
}

// One look at the job: its status text is copied, since it may die with the instance.
class JobStatus {
  public:
    JobStatus(const CMPIContext *context, const cim::Path &job) {
        const cim::Instance instance = cim::get_instance(context, job);
        const char *status = cim::text_of(cim::property(instance.get(), "JobStatus"));
        present_ = status != nullptr;
        copy(text_, view(status));
        state_ = cim::int_of(cim::property(instance.get(), "JobState"));
    }

    void log() const {
        log_format("jobstatus is %s\n", text_);
        log_format("JobState is %d\n", state_);
    }

    [[nodiscard]] bool is_present() const { return present_; }

    // "0x..|text": the part before the first "|" is a number, the part after it is judged. A
    // status without "|" is all text.
    [[nodiscard]] Verdict judge() {
        char *bar = std::strchr(text_, '|');
        const char *primary = "";
        const char *text = text_;
        if (bar != nullptr) {
            *bar = '\0';
            primary = text_;
            text = bar + 1;
        }
        log_format("primarystatus is %s\n", primary);
        log_format("jobstatus is %s\n", text);
        const int detail = strHexToDec(primary);
        log_format("l_DetailStatus is %d\n", detail);
        return esw::judge(detail, text);
    }

  private:
    bool present_ = false;
    int state_ = 0;
    char text_[kMessageSize] = {};
};

// Follows the job until it tells how the update ended. There is no limit of time as long as the
// controller reports one of its running texts.
Verdict follow_job(int index, const CMPIContext *context, const cim::Path &job) {
    int budget = kRetryBudget;
    int elapsed = 0;
    while (true) {
        log_entry("Enter GetESWJob Status.\n");
        JobStatus status(context, job);
        status.log();
        if (!status.is_present()) {
            if (--budget <= 0) {
                return kInstallErrorVerdict;
            }
            sleep(kPollSeconds);
            continue;
        }
        const Verdict verdict = status.judge();
        if (verdict.next != Verdict::kWait) {
            return verdict;
        }
        update_Pkg_Install_status(index, verdict.code, verdict.message);
        sleep(kPollSeconds);
        elapsed += static_cast<int>(kPollSeconds);
        log_value("Update time elapses ", elapsed);
        budget = kRetryBudget;
    }
}

}  // namespace
}  // namespace velk::esw

int installESWPkg(int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter installESWPkg.\n");
    if (!is_package_index(idx)) {
        return esw::kFailed;
    }
    cim::Path service = esw::make_service_path();
    if (!service) {
        return esw::kFailed;  // the package keeps the status that it has
    }
    const esw::Start start = esw::start_job(idx, context, std::move(service));
    if (!start.succeeded) {
        log_entry("Complete installZEBPackage\n");
        return esw::kFailed;
    }
    const Verdict end = esw::follow_job(idx, context, start.job);
    update_Pkg_Install_status(idx, end.code, end.message);
    log_entry("Complete installZEBPackage\n");
    return end.next == Verdict::kInstalled ? esw::kSucceeded : esw::kFailed;
}

int strHexToDec(const char *text) {
    const std::string_view digits = velk::view(text);
    unsigned value = 0;
    for (const char digit : digits.substr(std::min<std::size_t>(2, digits.size()))) {
        const auto code = static_cast<unsigned>(static_cast<unsigned char>(digit));
        unsigned weight = code - '0';
        if (digit >= 'A' && digit <= 'F') {
            weight = code - 'A' + 10;
        } else if (digit >= 'a' && digit <= 'f') {
            weight = code - 'a' + 10;
        }
        value = value * 16 + weight;
    }
    return static_cast<int>(value);
}
