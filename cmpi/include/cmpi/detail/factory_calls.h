#pragma once

// Short forms for the factories and services of the broker.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/broker_tables.h"
#include "cmpi/detail/enums.h"

inline CMPIInstance *CMNewInstance(const CMPIBroker *broker, const CMPIObjectPath *instance_path,
                                   CMPIStatus *status) {
    return broker->eft->newInstance(broker, instance_path, status);
}

inline CMPIObjectPath *CMNewObjectPath(const CMPIBroker *broker, const char *name_space,
                                       const char *class_name, CMPIStatus *status) {
    return broker->eft->newObjectPath(broker, name_space, class_name, status);
}

inline CMPIArgs *CMNewArgs(const CMPIBroker *broker, CMPIStatus *status) {
    return broker->eft->newArgs(broker, status);
}

inline CMPIString *CMNewString(const CMPIBroker *broker, const char *text, CMPIStatus *status) {
    return broker->eft->newString(broker, text, status);
}

inline CMPIArray *CMNewArray(const CMPIBroker *broker, CMPICount count, CMPIType type,
                             CMPIStatus *status) {
    return broker->eft->newArray(broker, count, type, status);
}

inline CMPIDateTime *CMNewDateTime(const CMPIBroker *broker, CMPIStatus *status) {
    return broker->eft->newDateTime(broker, status);
}

inline CMPIDateTime *CMNewDateTimeFromBinary(const CMPIBroker *broker, CMPIUint64 microseconds,
                                             CMPIBoolean is_interval, CMPIStatus *status) {
    return broker->eft->newDateTimeFromBinary(broker, microseconds, is_interval, status);
}

inline CMPIDateTime *CMNewDateTimeFromChars(const CMPIBroker *broker, const char *text,
                                            CMPIStatus *status) {
    return broker->eft->newDateTimeFromChars(broker, text, status);
}

inline CMPISelectExp *CMNewSelectExp(const CMPIBroker *broker, const char *query,
                                     const char *language, CMPIArray **projection,
                                     CMPIStatus *status) {
    return broker->eft->newSelectExp(broker, query, language, projection, status);
}

inline CMPIError *CMNewCMPIError(const CMPIBroker *broker, const char *owner, const char *id,
                                 const char *message, CMPIErrorSeverity severity,
                                 CMPIErrorProbableCause cause, CMPIrc rc, CMPIStatus *status) {
    return broker->eft->newCMPIError(broker, owner, id, message, severity, cause, rc, status);
}

inline CMPIBoolean CMClassPathIsA(const CMPIBroker *broker, const CMPIObjectPath *class_path,
                                  const char *class_name, CMPIStatus *status) {
    return broker->eft->classPathIsA(broker, class_path, class_name, status);
}

inline CMPIString *CDToString(const CMPIBroker *broker, const void *object, CMPIStatus *status) {
    return broker->eft->toString(broker, object, status);
}

inline CMPIBoolean CDIsOfType(const CMPIBroker *broker, const void *object, const char *type_name,
                              CMPIStatus *status) {
    return broker->eft->isOfType(broker, object, type_name, status);
}

inline CMPIString *CDGetType(const CMPIBroker *broker, const void *object, CMPIStatus *status) {
    return broker->eft->getType(broker, object, status);
}

inline CMPIStatus CMLogMessage(const CMPIBroker *broker, CMPISeverity severity, const char *id,
                               const char *text, const CMPIString *string) {
    return broker->eft->logMessage(broker, static_cast<int>(severity), id, text, string);
}

inline CMPIStatus CMTraceMessage(const CMPIBroker *broker, CMPILevel level, const char *component,
                                 const char *text, const CMPIString *string) {
    return broker->eft->trace(broker, static_cast<int>(level), component, text, string);
}

inline CMPIStatus CMOpenMessageFile(const CMPIBroker *broker, const char *file,
                                    CMPIMsgFileHandle *handle) {
    return broker->eft->openMessageFile(broker, file, handle);
}

inline CMPIStatus CMCloseMessageFile(const CMPIBroker *broker, CMPIMsgFileHandle handle) {
    return broker->eft->closeMessageFile(broker, handle);
}
