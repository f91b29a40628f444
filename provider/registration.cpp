// The factories, the function tables and what the broker asks before it unloads the library.
#include "provider/provider.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

const char *_VELKClassName = "PAKRO_VMpkgInstallationService";
const char *_VELKSuperClassName = "CIM_SoftwareInstallationService";
const char *_VELKNameSpace = "velk/cimv2";

namespace {

constexpr int kTableVersion = 200;

constexpr CMPIMethodMIFT kMethodTable = {
    kTableVersion,
    kTableVersion,
    "methodZEB_VMWarePackageInstallationProvider",
    ZEB_VMWarePackageInstallationProviderMethodCleanup,
    ZEB_VMWarePackageInstallationProviderInvokeMethod,
};

constexpr CMPIInstanceMIFT kInstanceTable = {
    kTableVersion,
    kTableVersion,
    "instanceZEB_VMWarePackageInstallationProvider",
    ZEB_VMWarePackageInstallationProviderCleanup,
    ZEB_VMWarePackageInstallationProviderEnumInstanceNames,
    ZEB_VMWarePackageInstallationProviderEnumInstances,
    ZEB_VMWarePackageInstallationProviderGetInstance,
    ZEB_VMWarePackageInstallationProviderCreateInstance,
    ZEB_VMWarePackageInstallationProviderModifyInstance,
    ZEB_VMWarePackageInstallationProviderDeleteInstance,
    ZEB_VMWarePackageInstallationProviderExecQuery,
};

CMPIMethodMI method_mi = {nullptr, const_cast<CMPIMethodMIFT *>(&kMethodTable)};
CMPIInstanceMI instance_mi = {nullptr, const_cast<CMPIInstanceMIFT *>(&kInstanceTable)};

constexpr CMPIStatus kNotSupported = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

void start(const CMPIBroker *broker) {
    ZEB_VMWarePackageInstallationBroker = broker;
    ZEB_VMWarePackageInstallationProviderInit();
}

}  // namespace

CMPIMethodMI *ZEB_VMWarePackageInstallationProvider_Create_MethodMI(const CMPIBroker *broker,
                                                                    const CMPIContext *,
                                                                    CMPIStatus *) {
    start(broker);
    return &method_mi;
}

CMPIInstanceMI *ZEB_VMWarePackageInstallationProvider_Create_InstanceMI(const CMPIBroker *broker,
                                                                        const CMPIContext *,
                                                                        CMPIStatus *) {
    start(broker);
    return &instance_mi;
}

int ZEB_VMWarePackageInstallationProviderInit(void) {
    return velk::log_entry("VELK:  Initializing the ZEB vmware package installation Provider.\n");
}

CMPIStatus ZEB_VMWarePackageInstallationProviderMethodCleanup(CMPIMethodMI *, const CMPIContext *,
                                                              CMPIBoolean) {
    velk::log_entry("calling ZEB_VMWarePackageInstallationProviderMethodCleanup.\n");
    const bool finished = velk::load(totalstatus) != 0;
    return {finished ? CMPI_RC_OK : CMPI_RC_NEVER_UNLOAD, nullptr};
}

CMPIStatus ZEB_VMWarePackageInstallationProviderCleanup(CMPIInstanceMI *, const CMPIContext *,
                                                        CMPIBoolean) {
    return {CMPI_RC_NEVER_UNLOAD, nullptr};
}

CMPIStatus ZEB_VMWarePackageInstallationProviderCreateInstance(CMPIInstanceMI *,
                                                               const CMPIContext *,
                                                               const CMPIResult *,
                                                               const CMPIObjectPath *,
                                                               const CMPIInstance *) {
    return kNotSupported;
}

CMPIStatus ZEB_VMWarePackageInstallationProviderModifyInstance(
    CMPIInstanceMI *, const CMPIContext *, const CMPIResult *, const CMPIObjectPath *,
    const CMPIInstance *, const char **) {
    return kNotSupported;
}

CMPIStatus ZEB_VMWarePackageInstallationProviderDeleteInstance(CMPIInstanceMI *,
                                                               const CMPIContext *,
                                                               const CMPIResult *,
                                                               const CMPIObjectPath *) {
    return kNotSupported;
}

CMPIStatus ZEB_VMWarePackageInstallationProviderExecQuery(CMPIInstanceMI *, const CMPIContext *,
                                                          const CMPIResult *,
                                                          const CMPIObjectPath *, const char *,
                                                          const char *) {
    return kNotSupported;
}
