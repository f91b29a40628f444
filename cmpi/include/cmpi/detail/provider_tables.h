#pragma once

// Tables that a provider fills, one per kind ("MI": management instrumentation).
// ftVersion and miVersion are CMPICurrentVersion.

#include "cmpi/detail/objects.h"

extern "C" {

// Instances of a class. A broker of the sfcb kind calls every slot, so none may be null.
struct _CMPIInstanceMIFT {
    int ftVersion;
    int miVersion;
    const char *miName;

    // May answer DO_NOT_UNLOAD or NEVER_UNLOAD unless `terminating`.
    CMPIStatus (*cleanup)(CMPIInstanceMI *mi, const CMPIContext *context, CMPIBoolean terminating);
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI *mi, const CMPIContext *context,
                                         const CMPIResult *result,
                                         const CMPIObjectPath *class_path);
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI *mi, const CMPIContext *context,
                                     const CMPIResult *result, const CMPIObjectPath *class_path,
                                     const char **properties);
    CMPIStatus (*getInstance)(CMPIInstanceMI *mi, const CMPIContext *context,
                              const CMPIResult *result, const CMPIObjectPath *instance_path,
                              const char **properties);
    CMPIStatus (*createInstance)(CMPIInstanceMI *mi, const CMPIContext *context,
                                 const CMPIResult *result, const CMPIObjectPath *class_path,
                                 const CMPIInstance *instance);
    CMPIStatus (*modifyInstance)(CMPIInstanceMI *mi, const CMPIContext *context,
                                 const CMPIResult *result, const CMPIObjectPath *instance_path,
                                 const CMPIInstance *instance, const char **properties);
    CMPIStatus (*deleteInstance)(CMPIInstanceMI *mi, const CMPIContext *context,
                                 const CMPIResult *result, const CMPIObjectPath *path);
    CMPIStatus (*execQuery)(CMPIInstanceMI *mi, const CMPIContext *context,
                            const CMPIResult *result, const CMPIObjectPath *class_path,
                            const char *query, const char *language);
};

// Traversal of associations. A broker of the sfcb kind calls every slot, so none may be null.
struct _CMPIAssociationMIFT {
    int ftVersion;
    int miVersion;
    const char *miName;

    // May answer DO_NOT_UNLOAD or NEVER_UNLOAD unless `terminating`.
    CMPIStatus (*cleanup)(CMPIAssociationMI *mi, const CMPIContext *context,
                          CMPIBoolean terminating);
    CMPIStatus (*associators)(CMPIAssociationMI *mi, const CMPIContext *context,
                              const CMPIResult *result, const CMPIObjectPath *instance_path,
                              const char *assoc_class, const char *result_class, const char *role,
                              const char *result_role, const char **properties);
    CMPIStatus (*associatorNames)(CMPIAssociationMI *mi, const CMPIContext *context,
                                  const CMPIResult *result, const CMPIObjectPath *instance_path,
                                  const char *assoc_class, const char *result_class,
                                  const char *role, const char *result_role);
    CMPIStatus (*references)(CMPIAssociationMI *mi, const CMPIContext *context,
                             const CMPIResult *result, const CMPIObjectPath *instance_path,
                             const char *result_class, const char *role, const char **properties);
    CMPIStatus (*referenceNames)(CMPIAssociationMI *mi, const CMPIContext *context,
                                 const CMPIResult *result, const CMPIObjectPath *instance_path,
                                 const char *result_class, const char *role);
};

// Extrinsic methods. A broker of the sfcb kind calls every slot, so none may be null.
struct _CMPIMethodMIFT {
    int ftVersion;
    int miVersion;
    const char *miName;

    // May answer DO_NOT_UNLOAD or NEVER_UNLOAD unless `terminating`.
    CMPIStatus (*cleanup)(CMPIMethodMI *mi, const CMPIContext *context, CMPIBoolean terminating);
    CMPIStatus (*invokeMethod)(CMPIMethodMI *mi, const CMPIContext *context,
                               const CMPIResult *result, const CMPIObjectPath *target,
                               const char *method, const CMPIArgs *in, CMPIArgs *out);
};

// Single properties. setProperty and setPropertyWithOrigin take their value by value.
// Brokers of the sfcb kind use instance requests in place of this table.
struct _CMPIPropertyMIFT {
    int ftVersion;
    int miVersion;
    const char *miName;

    // May answer DO_NOT_UNLOAD or NEVER_UNLOAD unless `terminating`.
    CMPIStatus (*cleanup)(CMPIPropertyMI *mi, const CMPIContext *context, CMPIBoolean terminating);
    CMPIStatus (*setProperty)(CMPIPropertyMI *mi, const CMPIContext *context,
                              const CMPIResult *result, const CMPIObjectPath *instance_path,
                              const char *name, CMPIData data);
    CMPIStatus (*getProperty)(CMPIPropertyMI *mi, const CMPIContext *context,
                              const CMPIResult *result, const CMPIObjectPath *instance_path,
                              const char *name);
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI *mi, const CMPIContext *context,
                                        const CMPIResult *result, CMPIObjectPath *instance_path,
                                        const char *name, CMPIData data, const char *origin);
};

// Indications. The 2.1 edition gave mustPoll another parameter; this is the 2.0 form.
// Brokers of the sfcb kind call pre-1.0 shapes when ftVersion is below 100.
struct _CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char *miName;

    // May answer DO_NOT_UNLOAD or NEVER_UNLOAD unless `terminating`.
    CMPIStatus (*cleanup)(CMPIIndicationMI *mi, const CMPIContext *context,
                          CMPIBoolean terminating);
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI *mi, const CMPIContext *context,
                                  const CMPISelectExp *filter, const char *class_name,
                                  const CMPIObjectPath *class_path, const char *owner);
    CMPIStatus (*mustPoll)(CMPIIndicationMI *mi, const CMPIContext *context,
                           const CMPISelectExp *filter, const char *class_name,
                           const CMPIObjectPath *class_path);
    CMPIStatus (*activateFilter)(CMPIIndicationMI *mi, const CMPIContext *context,
                                 const CMPISelectExp *filter, const char *class_name,
                                 const CMPIObjectPath *class_path, CMPIBoolean first);
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI *mi, const CMPIContext *context,
                                   const CMPISelectExp *filter, const char *class_name,
                                   const CMPIObjectPath *class_path, CMPIBoolean last);
    CMPIStatus (*enableIndications)(CMPIIndicationMI *mi, const CMPIContext *context);
    CMPIStatus (*disableIndications)(CMPIIndicationMI *mi, const CMPIContext *context);
};

}  // extern "C"
