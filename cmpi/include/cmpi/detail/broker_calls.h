#pragma once

// Short forms for the up-calls.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/broker_tables.h"

inline CMPIContext *CBPrepareAttachThread(const CMPIBroker *broker, const CMPIContext *context) {
    return broker->bft->prepareAttachThread(broker, context);
}

inline CMPIStatus CBAttachThread(const CMPIBroker *broker, const CMPIContext *context) {
    return broker->bft->attachThread(broker, context);
}

inline CMPIStatus CBDetachThread(const CMPIBroker *broker, const CMPIContext *context) {
    return broker->bft->detachThread(broker, context);
}

inline CMPIStatus CBDeliverIndication(const CMPIBroker *broker, const CMPIContext *context,
                                      const char *name_space, const CMPIInstance *indication) {
    return broker->bft->deliverIndication(broker, context, name_space, indication);
}

inline CMPIEnumeration *CBEnumInstanceNames(const CMPIBroker *broker, const CMPIContext *context,
                                            const CMPIObjectPath *class_path, CMPIStatus *status) {
    return broker->bft->enumerateInstanceNames(broker, context, class_path, status);
}

inline CMPIEnumeration *CBEnumInstances(const CMPIBroker *broker, const CMPIContext *context,
                                        const CMPIObjectPath *class_path, const char **properties,
                                        CMPIStatus *status) {
    return broker->bft->enumerateInstances(broker, context, class_path, properties, status);
}

inline CMPIInstance *CBGetInstance(const CMPIBroker *broker, const CMPIContext *context,
                                   const CMPIObjectPath *instance_path, const char **properties,
                                   CMPIStatus *status) {
    return broker->bft->getInstance(broker, context, instance_path, properties, status);
}

inline CMPIObjectPath *CBCreateInstance(const CMPIBroker *broker, const CMPIContext *context,
                                        const CMPIObjectPath *class_path,
                                        const CMPIInstance *instance, CMPIStatus *status) {
    return broker->bft->createInstance(broker, context, class_path, instance, status);
}

inline CMPIStatus CBModifyInstance(const CMPIBroker *broker, const CMPIContext *context,
                                   const CMPIObjectPath *instance_path,
                                   const CMPIInstance *instance, const char **properties) {
    return broker->bft->modifyInstance(broker, context, instance_path, instance, properties);
}

inline CMPIStatus CBDeleteInstance(const CMPIBroker *broker, const CMPIContext *context,
                                   const CMPIObjectPath *instance_path) {
    return broker->bft->deleteInstance(broker, context, instance_path);
}

inline CMPIEnumeration *CBExecQuery(const CMPIBroker *broker, const CMPIContext *context,
                                    const CMPIObjectPath *class_path, const char *query,
                                    const char *language, CMPIStatus *status) {
    return broker->bft->execQuery(broker, context, class_path, query, language, status);
}

inline CMPIEnumeration *CBAssociators(const CMPIBroker *broker, const CMPIContext *context,
                                      const CMPIObjectPath *instance_path, const char *assoc_class,
                                      const char *result_class, const char *role,
                                      const char *result_role, const char **properties,
                                      CMPIStatus *status) {
    return broker->bft->associators(broker, context, instance_path, assoc_class, result_class, role,
                                    result_role, properties, status);
}

inline CMPIEnumeration *CBAssociatorNames(const CMPIBroker *broker, const CMPIContext *context,
                                          const CMPIObjectPath *instance_path,
                                          const char *assoc_class, const char *result_class,
                                          const char *role, const char *result_role,
                                          CMPIStatus *status) {
    return broker->bft->associatorNames(broker, context, instance_path, assoc_class, result_class,
                                        role, result_role, status);
}

inline CMPIEnumeration *CBReferences(const CMPIBroker *broker, const CMPIContext *context,
                                     const CMPIObjectPath *instance_path, const char *result_class,
                                     const char *role, const char **properties,
                                     CMPIStatus *status) {
    return broker->bft->references(broker, context, instance_path, result_class, role, properties,
                                   status);
}

inline CMPIEnumeration *CBReferenceNames(const CMPIBroker *broker, const CMPIContext *context,
                                         const CMPIObjectPath *instance_path,
                                         const char *result_class, const char *role,
                                         CMPIStatus *status) {
    return broker->bft->referenceNames(broker, context, instance_path, result_class, role, status);
}

inline CMPIData CBInvokeMethod(const CMPIBroker *broker, const CMPIContext *context,
                               const CMPIObjectPath *target, const char *method, const CMPIArgs *in,
                               CMPIArgs *out, CMPIStatus *status) {
    return broker->bft->invokeMethod(broker, context, target, method, in, out, status);
}

inline CMPIStatus CBSetProperty(const CMPIBroker *broker, const CMPIContext *context,
                                const CMPIObjectPath *instance_path, const char *name,
                                const CMPIValue *value, CMPIType type) {
    return broker->bft->setProperty(broker, context, instance_path, name, value, type);
}

inline CMPIData CBGetProperty(const CMPIBroker *broker, const CMPIContext *context,
                              const CMPIObjectPath *instance_path, const char *name,
                              CMPIStatus *status) {
    return broker->bft->getProperty(broker, context, instance_path, name, status);
}

inline unsigned int CBBrokerVersion(const CMPIBroker *broker) {
    return broker->bft->brokerVersion;
}

inline const char *CBBrokerName(const CMPIBroker *broker) {
    return broker->bft->brokerName;
}
