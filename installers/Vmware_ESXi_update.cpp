#include "installers/Vmware_ESXi_update.h"

#include <unistd.h>

#include <array>
#include <optional>

#include "installers/job_verdict.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/status_report.h"

namespace velk::hypervisor {
namespace {

using namespace status_code;

constexpr int kSucceeded = 1;
constexpr int kFailed = 0;

constexpr const char *kNamespace = "root/cimv2";
constexpr const char *kServiceClass = "VMware_SoftwareInstallationService";
constexpr const char *kTargetClass = "OMC_UnitaryComputerSystem";
constexpr const char *kJobClass = "VMware_ConcreteJob";

constexpr unsigned kPollSeconds = 10;
constexpr std::size_t kTextSize = 1024;

// The only success that is known is the one that asks for a restart.
// clang-format off
constexpr std::array kVocabulary = {
    VocabularyRow{"The update completed successfully, but the system needs to be rebooted for the changes to be effective.",
        {kInstalled, "Package installation successfully.", Verdict::kInstalled}},
    VocabularyRow{"Updates at supplied URI are obsolete or already installed",
        {kNothingToUpdate, "The Updates are obsolete or already installed.", Verdict::kInstalled}},
    VocabularyRow{"Scanning URI for installable packages",
        {kScanning, "Scanning URI for installable packages.", Verdict::kWait}},
    VocabularyRow{"Scan of URI Complete and installable packages found. Starting Update.",
        {kUpdating, "Scan of URI Complete and installable packages found. Starting Update.", Verdict::kWait}},
};
// clang-format on

using SystemName = std::optional<Text<kTextSize>>;

const char *text_or_null(const SystemName &name) {
    return name ? name->c_str() : nullptr;
}

// The system that the last installation service belongs to. The two bytes behind the question mark
// are part of the log's text.
SystemName find_system(const CMPIContext *context, const cim::Path &service) {
    SystemName system;
    const auto services = cim::Instances::of(context, service);
    for (const CMPIInstance *instance : services) {
        const char *name = cim::key_of(instance, "SystemName");
        system.reset();
        if (name != nullptr) {
            system.emplace(name);
        }
        log_value("vm enumerate next?\xA1\xEA\n", view(name));
    }
    return system;
}

void add_service_keys(const cim::Path &service, const SystemName &system) {
    cim::add_key(service, "CreationClassName", kServiceClass);
    cim::add_key(service, "SystemName", text_or_null(system));
    cim::add_key(service, "Name", "SoftwareInstallationService");
    cim::add_key(service, "SystemCreationClassName", kTargetClass);
}

cim::Path make_target(const SystemName &system) {
    cim::Path target = cim::make_path(kNamespace, kTargetClass);
    cim::add_key(target, "CreationClassName", kTargetClass);
    cim::add_key(target, "Name", text_or_null(system));
    return target;
}

// Only the call's status counts; what the method returns is logged. Returns false after a failure
// has been reported.
bool start_install(int index, const CMPIContext *context, cim::Path service, cim::Path target) {
    const char *uri = pkgInstance[index].TFTPPayloadPkgURIs;
    const cim::Args in = cim::make_args();
    const cim::Args out = cim::make_args();
    cim::add_text(in, "URI", uri);
    cim::add_reference(in.get(), "Target", target.get());
    log_value("To install package...", view(uri));
    const cim::Call call = cim::invoke(context, service, "InstallFromURI", in, out);
    log_format("%d\n", call.value);
    target.reset();
    service.reset();
    if (call.status.rc == CMPI_RC_OK) {
        return true;
    }
    report_not_started(index, call.status);
    return false;
}

// The status of the last job decides; no job is matched to the call that started it. No value when
// the jobs cannot be enumerated, there is none or the last one gives no status.
std::optional<Text<kTextSize>> read_job_status(const CMPIContext *context) {
    std::optional<Text<kTextSize>> status;
    const auto jobs = cim::Instances::of(context, cim::make_path(kNamespace, kJobClass));
    for (const CMPIInstance *job : jobs) {
        const char *text = cim::text_of(cim::property(job, "JobStatus"));
        status.reset();
        if (text != nullptr) {
            status.emplace(text);
        }
    }
    return status;
}

// There is no limit of time as long as the provider reports one of its scanning texts.
Verdict follow_job(int index, const CMPIContext *context) {
    int elapsed = 0;
    while (true) {
        log_entry("Enter GetVMWareJobstatus.\n");
        const auto status = read_job_status(context);
        if (!status) {
            return kInstallErrorVerdict;
        }
        log_format("%s\n", status->c_str());
        const Verdict verdict = judge(kVocabulary, status->c_str());
        if (verdict.next != Verdict::kWait) {
            return verdict;
        }
        update_Pkg_Install_status(index, verdict.code, verdict.message);
        sleep(kPollSeconds);
        elapsed += static_cast<int>(kPollSeconds);
        log_value("Update time elapses ", elapsed);
    }
}

}  // namespace
}  // namespace velk::hypervisor

int installVMPkg(int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("Enter InstallVMPkg\n");
    if (!is_package_index(idx)) {
        return hypervisor::kFailed;
    }
    PackageRecord &package = pkgInstance[idx];
    append(package.TFTPPayloadPkgURIs, "metadata.zip");
    log_value("pkgInstance[pkgIdx].TFTPPayloadPkgURIs =", view(package.TFTPPayloadPkgURIs));
    cim::Path service = cim::make_path(hypervisor::kNamespace, hypervisor::kServiceClass);
    const hypervisor::SystemName system = hypervisor::find_system(context, service);
    hypervisor::add_service_keys(service, system);
    if (!service) {
        return hypervisor::kFailed;  // the package keeps the status that it has
    }
    log_entry("Create VMware_SoftwareInstallationService successfully?\xA1\xEA\n");
    cim::Path target = hypervisor::make_target(system);
    if (!target) {
        log_entry("Create OMC_UnitaryComputerSystem failed.\n");
        update_Pkg_Install_status(idx, status_code::kNotStarted,
                                  "Create OMC_UnitaryComputerSystem failed.");
        return hypervisor::kFailed;
    }
    log_entry("Create OMC_UnitaryComputerSystem sucessfully.\n");
    if (!hypervisor::start_install(idx, context, std::move(service), std::move(target))) {
        log_entry("Complete InstallVMPkg\n");
        return hypervisor::kFailed;
    }
    const Verdict end = hypervisor::follow_job(idx, context);
    update_Pkg_Install_status(idx, end.code, end.message);
    return end.next == Verdict::kInstalled ? hypervisor::kSucceeded : hypervisor::kFailed;
}
