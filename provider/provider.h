// What the broker calls: the factories that it looks up by name and the members of the two
// function tables that they return. Every status has a null message unless stated.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include "velk/api.h"

// The class that the provider serves.
VELK_API const char *_VELKClassName;
VELK_API const char *_VELKSuperClassName;
VELK_API const char *_VELKNameSpace;

// ---- Life cycle (registration.cpp) ----

// Both keep `broker` for all later calls and return a static object; `status` is left as it is.
VELK_API CMPIMethodMI *ZEB_VMWarePackageInstallationProvider_Create_MethodMI(
    const CMPIBroker *broker, const CMPIContext *context, CMPIStatus *status);
VELK_API CMPIInstanceMI *ZEB_VMWarePackageInstallationProvider_Create_InstanceMI(
    const CMPIBroker *broker, const CMPIContext *context, CMPIStatus *status);

// Logs that the provider starts. Returns the result of closing the log.
VELK_API int ZEB_VMWarePackageInstallationProviderInit(void);

// CMPI_RC_OK once the last package of a request has reported a final result, else
// CMPI_RC_NEVER_UNLOAD. Frees nothing.
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderMethodCleanup(CMPIMethodMI *mi,
                                                                       const CMPIContext *context,
                                                                       CMPIBoolean terminating);

// Always CMPI_RC_NEVER_UNLOAD.
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderCleanup(CMPIInstanceMI *mi,
                                                                 const CMPIContext *context,
                                                                 CMPIBoolean terminating);

// ---- Methods (method_dispatch.cpp) ----

VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderInvokeMethod(
    CMPIMethodMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const char *methodName, const CMPIArgs *in, CMPIArgs *out);

// ---- The service instance (service_instance.cpp) ----

VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderEnumInstanceNames(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference);
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderEnumInstances(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const char **properties);
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderGetInstance(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const char **properties);

// Not supported: CMPI_RC_ERR_NOT_SUPPORTED, all arguments ignored.
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderCreateInstance(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const CMPIInstance *instance);
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderModifyInstance(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const CMPIInstance *instance, const char **properties);
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderDeleteInstance(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference);
VELK_API CMPIStatus ZEB_VMWarePackageInstallationProviderExecQuery(
    CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
    const CMPIObjectPath *reference, const char *query, const char *language);

// The host's node name into `buffer`, at most `length` bytes, without a terminator when it fills
// them. Returns `buffer`.
VELK_API char *get_sys_name(char *buffer, int length);
