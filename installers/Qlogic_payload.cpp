// One payload through the QLogic service, and its job.
#include <unistd.h>

#include "installers/Qlogic_update.h"
#include "installers/adapter_frame.h"
#include "installers/adapter_service.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk::qlogic {
namespace {

constexpr const char *kNamespace = "qlogic/cimv2";
constexpr const char *kSystemClass = "QLogic_Adapter_ComputerSystem";

// InstallOptions, from the vendor-reserved range of DSP1023.
constexpr std::uint16_t kUpdateOption = 32768;

// CIM_ConcreteJob.JobState (DSP1103).
constexpr int kJobRunning = 4;
constexpr int kJobCompleted = 7;

constexpr int kJobFailed = 10;
constexpr unsigned kPollSeconds = 10;

// What distinguishes the two kinds of function. The Fibre Channel texts name other classes in
// places; that is how the log has always had them.
struct Function {
    const char *enter_line;
    const char *service_class;
    const char *system_label;
    const char *service_line;
    const char *target_line;
    const char *no_target_line;
    const char *running_line;
    const char *failed_line;
};

constexpr Function kNic = {
    .enter_line = "Eneter installSingleQlgNICpayload.\n",
    .service_class = "QLogic_NIC_SoftwareInstallationService",
    .system_label = "Qlogic NIC SystemName =",
    .service_line = "Create QLogic_NIC_SoftwareInstallationService successfully.\n",
    .target_line = "Create QLogic_NIC_PortController sucessfully.\n",
    .no_target_line = "Create QLogic_NIC_PortController failed.\n",
    .running_line = "Qlogic nic update is running.\n",
    .failed_line = "Qlogic nic update is failed due to the jobState is 10.\n",
};

constexpr Function kFibreChannel = {
    .enter_line = "Eneter installSingleQlgFCpayload.\n",
    .service_class = "QLogic_FCHBA_SoftwareInstallationService",
    .system_label = "Qlogic SystemName =",
    .service_line = "Create QLogicFCHBA_SoftwareInstallationService successfully.\n",
    .target_line = "Create QLogic_FCHBA_PortController sucessfully.\n",
    .no_target_line = "Create OMC_UnitaryComputerSystem failed.\n",
    .running_line = "Qlogic fc update is running.\n",
    .failed_line = "Qlogic fc update is failed due to the jobState is 10.\n",
};

cim::Path make_service(const Function &function, const CMPIContext *context) {
    cim::Path service = cim::make_path(kNamespace, function.service_class);
    adapter::SystemName system;
    system.find(context, service,
                [&](const char *name) { log_untimed(function.system_label, name); });
    cim::add_key(service, "CreationClassName", function.service_class);
    cim::add_key(service, "SystemName", system.get());
    cim::add_key(service, "Name", "CNA_SW_INSTALLER");
    cim::add_key(service, "SystemCreationClassName", kSystemClass);
    return service;
}

void add_install_options(const cim::Args &in) {
    log_entry("+++passing IN InstallOptions argument - type uint16[].\n");
    const cim::Array options = cim::make_uint16_array(1);
    log_entry("+++Setting InstallOptions element - Update.\n");
    cim::set_element(options, 0, kUpdateOption);
    log_entry("+++Adding InstallOptions to argument array.\n");
    cim::add_uint16_array(in, "InstallOptions", options);
}

int job_state(const CMPIContext *context, const cim::Path &job) {
    const cim::Instance instance = cim::get_instance(context, job);
    return cim::int_of(cim::property(instance.get(), "JobState"));
}

// There is no limit of time as long as the job is running.
int follow_job(const Function &function, const CMPIContext *context, const cim::Path &job) {
    int elapsed = 0;
    while (true) {
        log_entry("Enter Get installSingleQlgNICpayload Status.\n");
        const int state = job_state(context, job);
        log_format("JobState is %d\n", state);
        if (state == kJobCompleted) {
            return adapter::kSucceeded;
        }
        if (state != kJobRunning) {
            log_entry(function.failed_line);
            return kJobFailed;
        }
        log_entry(function.running_line);
        sleep(kPollSeconds);
        elapsed += static_cast<int>(kPollSeconds);
        log_value("Update time elapses", elapsed);
    }
}

int call_service(const Function &function, const CMPIContext *context, const cim::Path &service,
                 const cim::Args &in, const char *payload) {
    const cim::Args out = cim::make_args();
    const adapter::PayloadUri uri = adapter::payload_uri(payload);
    cim::add_text(in, "URI", uri.c_str());
    log_value("To install package...", view(uri.c_str()));
    log_entry("Invoking InstallFromURI Method and Updating flash image.Please wait...\n");
    const cim::Call call = cim::invoke(context, service, "InstallFromURI", in, out);
    log_format("CBInvokeMethod Retcode:%d\n", call.value);
    if (call.value != adapter::kJobStarted) {
        log_value("Package installation error message:", cim::message_of(call.status));
        return adapter::kCallFailed;
    }
    return follow_job(function, context, cim::clone_reference(cim::argument(out.get(), "Job")));
}

int install_single(const Function &function, const CMPIContext *context, const char *payload,
                   const CMPIInstance *port_controller) {
    log_entry(function.enter_line);
    const cim::Path service = make_service(function, context);
    if (!service) {
        return adapter::kNoObjectPath;
    }
    log_entry(function.service_line);
    const cim::Args in = cim::make_args();
    add_install_options(in);
    log_entry("+++passing IN Target argument - type ref.\n");
    const CMPIObjectPath *target = cim::path_of(port_controller);
    if (target == nullptr) {
        log_entry(function.no_target_line);
        return adapter::kNoObjectPath;
    }
    log_entry(function.target_line);
    cim::add_reference(in.get(), "Target", target);
    return call_service(function, context, service, in, payload);
}

}  // namespace
}  // namespace velk::qlogic

int installSingleQlgNICpayload(const CMPIContext *context, const char *payloadPath,
                               const CMPIInstance *portController) {
    return velk::qlogic::install_single(velk::qlogic::kNic, context, payloadPath, portController);
}

int installSingleQlgFCpayload(const CMPIContext *context, const char *payloadPath,
                              const CMPIInstance *portController) {
    return velk::qlogic::install_single(velk::qlogic::kFibreChannel, context, payloadPath,
                                        portController);
}
