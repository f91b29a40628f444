#include "provider/install_request.h"

#include <unistd.h>

#include <string_view>

#include "provider/install_thread.h"
#include "provider/job_registration.h"
#include "provider/package_list.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/job_id.h"
#include "velk/package_table.h"
#include "velk/request_state.h"

namespace velk {
namespace {

// The method's own return values.
constexpr unsigned kJobStarted = 4096;
constexpr unsigned kFailed = 1;
constexpr unsigned kInvalidParameter = 3;

// Elements of InstallOptions, from the vendor-reserved range of DSP1023.
constexpr int kInstallSynchronously = 32768;
constexpr int kInstallAsynchronously = 32769;

MethodAnswer refuse_early(const char *message, unsigned return_value) {
    MethodAnswer answer = refuse(CMPI_RC_ERR_FAILED, message, return_value);
    answer.logs_completion = false;
    return answer;
}

void read_option(int option) {
    if (option == kInstallSynchronously) {
        store(is_sync_install, 1);
    } else if (option == kInstallAsynchronously) {
        store(is_async_install, 1);
    }
}

// The flags are only ever set: an option of one request holds for all that follow in the process.
// `status` takes the status of each element's access.
void read_install_options(const CMPIArgs *in, CMPIStatus &status) {
    const CMPIData options = cim::argument(in, "InstallOptions");
    log_entry("Get InstallOptions parameter.\n");
    if (options.type != CMPI_uint16A || options.value.array == nullptr) {
        store(is_async_install, 1);
        return;
    }
    const CMPICount count = CMGetArrayCount(options.value.array, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        const CMPIData element = CMGetArrayElementAt(options.value.array, i, &status);
        if (cim::is_present(status, element)) {
            read_option(element.value.uint16);
        }
    }
    if (load(is_sync_install) != 1) {
        store(is_async_install, 1);
    }
}

void read_update_args(const CMPIArgs *in) {
    const char *text = cim::text_of(cim::argument(in, "UpdateArgs"));
    if (text == nullptr) {
        return;  // both flags keep what an earlier request left
    }
    const std::string_view arguments(text);
    log_format("UpdateArgs = %s\n", text);
    const bool backup = arguments.find("--backup") != std::string_view::npos;
    log_entry(backup ? "--backup is selected.\n" : "--backup is not selected.\n");
    store(g_is_backup_update, backup ? 1 : 0);
    const bool no_reboot = arguments.find("--no-reboot") != std::string_view::npos;
    log_entry(no_reboot ? "--no-reboot is selected.\n" : "--no_reboot is not selected.\n");
    store(g_is_noreboot_update, no_reboot ? 1 : 0);
}

void detect_client() {
    const std::string_view location = view(pkgInstance[0].TFTPXMLPkgURIs);
    const auto has = [location](std::string_view scheme) {
        return location.find(scheme) != std::string_view::npos;
    };
    const bool is_manager = has("tftp://") || has("sftp://");
    store(invoke_client, is_manager ? kUpdateManager : kPakroClient);
    log_entry(is_manager ? "VELK is called by UM.\n" : "VELK is called by PAKRO client.\n");
}

void return_job(const Invocation &invocation) {
    const char *name_space = cim::text_of(CMGetNameSpace(invocation.reference, nullptr));
    const cim::Path job = cim::make_path(name_space, "ZEB_ConcreteJob");
    cim::add_key(job, "InstanceID", instanceID);
    cim::add_reference(invocation.out, "Job", job.get());
}

MethodAnswer start_install(const Invocation &invocation) {
    if (!register_job()) {
        return refuse_early("Fail to create job instance", kFailed);
    }
    log_entry("New Job Created successfully.\n");
    AsyncInstallArg argument = {job_number(view(instanceID)).value_or(0), invocation.context};
    log_entry("Creating new thread\n");
    pthread_t thread = {};
    const int error = pthread_create(&thread, nullptr, asyncInstallAllPkgs, &argument);
    sleep(1);  // the argument lives in this frame: the thread must have read it by now
    if (error != 0) {
        log_entry("Create new thread fail.\n");
        return refuse_early("Fail to create file transfer thread.", kFailed);
    }
    log_entry("Create new thread success.\n");
    pthread_detach(thread);
    return_job(invocation);
    log_entry("Job accomplished.\n");
    return {.return_value = kJobStarted};
}

}  // namespace

MethodAnswer install_from_uri(const Invocation &invocation) {
    log_entry("calling Method: InstallFromURI.\n");
    open_debug_log();  // stays open for good, one descriptor per request
    if (load(Velkchild_thread_num) > 0) {
        return refuse_early("An installation process is running", kFailed);
    }
    if (invocation.in == nullptr) {
        return refuse(CMPI_RC_ERR_METHOD_NOT_FOUND, "IN Parameter is NULL", 0);
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData uri = CMGetArg(invocation.in, "URI", &status);
    log_entry("Get In parameter.\n");
    if (uri.type != CMPI_string || cim::text_of(uri) == nullptr) {
        return refuse_early("Invalid parameter URI.", kInvalidParameter);
    }
    read_install_options(invocation.in, status);
    read_update_args(invocation.in);
    initPkgInstall(cim::text_of(uri));
    if (load(is_sync_install) == 1 || load(is_async_install) == 0) {
        return {.status = status, .sends_value = false};
    }
    detect_client();
    log_entry("using async installation.\n");
    MethodAnswer answer = start_install(invocation);
    if (answer.status.rc == CMPI_RC_OK) {
        answer.status = status;
    }
    return answer;
}

}  // namespace velk
