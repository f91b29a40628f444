// Every extrinsic method call on the service comes in here and is answered from here.
#include <strings.h>

#include <array>

#include "provider/install_request.h"
#include "provider/maintenance.h"
#include "provider/provider.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk {

MethodAnswer refuse(CMPIrc code, const char *message, unsigned return_value) {
    CMPIString *text = CMNewString(ZEB_VMWarePackageInstallationBroker, message, nullptr);
    return {.status = {code, text}, .return_value = return_value};
}

namespace {

MethodAnswer run_reset_cimmon(const Invocation &) {
    log_entry("Enter ResetCimmon.\n");
    reset_cimmon();
    return {};
}

MethodAnswer delete_debug_log(const Invocation &) {
    log_entry("calling Method: DeleteVELKDebugLogFile\n");
    DeleteVelkDebugLog();
    return {};
}

struct Method {
    const char *name;
    MethodAnswer (*run)(const Invocation &invocation);
};

constexpr std::array kMethods = {
    Method{"InstallFromURI", install_from_uri},
    Method{"ResetCimmon", run_reset_cimmon},
    Method{"DeleteVELKDebugLogFile", delete_debug_log},
};

// CIM names are compared without regard to case.
bool names_equal(const char *left, const char *right) {
    return left != nullptr && strcasecmp(left, right) == 0;
}

bool is_our_class(const CMPIObjectPath *reference) {
    return reference != nullptr &&
           names_equal(cim::text_of(CMGetClassName(reference, nullptr)), _VELKClassName);
}

MethodAnswer dispatch(const Invocation &invocation, const char *name) {
    if (is_our_class(invocation.reference)) {
        for (const Method &method : kMethods) {
            if (names_equal(name, method.name)) {
                return method.run(invocation);
            }
        }
    }
    return refuse(CMPI_RC_ERR_METHOD_NOT_FOUND, "InValid Method Name", 0);
}

void send_value(const CMPIResult *result, unsigned return_value) {
    CMPIValue value = {};
    value.uint32 = return_value;
    CMReturnData(result, &value, CMPI_uint32);
    CMReturnDone(result);
}

}  // namespace
}  // namespace velk

CMPIStatus ZEB_VMWarePackageInstallationProviderInvokeMethod(
    CMPIMethodMI *, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const char *methodName, const CMPIArgs *in, CMPIArgs *out) {
    using namespace velk;
    log_entry("Enter ZEB_VMWarePackageInstallationProviderInvokeMethod.\n");
    log_entry("velk version is 5.1-9.100 for patch9.\n");
    log_value("methodName:", view(methodName));
    const MethodAnswer answer = dispatch({context, reference, in, out}, methodName);
    if (answer.sends_value) {
        send_value(result, answer.return_value);
    }
    if (answer.logs_completion) {
        log_entry("Complete ZEB_VMWarePackageInstallationProviderInvokeMethod.\n");
    }
    return answer.status;
}
