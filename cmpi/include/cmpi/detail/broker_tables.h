#pragma once

// The broker object and the tables behind it.

#include <cstddef>

#include "cmpi/cmpios.h"
#include "cmpi/detail/error_enums.h"
#include "cmpi/detail/objects.h"
#include "cmpi/detail/probable_cause.h"

extern "C" {

// What a broker hands to every factory: its private data and the tables of its services.
// `mft` may be null (a broker without memory services; those of the sfcb kind are such).
struct _CMPIBroker {
    void *hdl;
    CMPIBrokerFT *bft;
    CMPIBrokerEncFT *eft;
    CMPIBrokerExtFT *xft;
    CMPIBrokerMemFT *mft;
};

// Requests that go back to the broker, "up-calls". The context is never null and holds at least
// CMPIPrincipal. Property lists end with a null entry; a null list stands for all properties.
// No empty slot in brokers of the sfcb kind, but setProperty and getProperty always answer
// NOT_SUPPORTED there.
struct _CMPIBrokerFT {
    unsigned int brokerCapabilities;  // CMPI_MB_... masks
    unsigned int brokerVersion;       // 0 in brokers of the sfcb kind
    const char *brokerName;

    // -- Threads --
    // In the thread that owns `context`, before its provider call returns; null on failure.
    CMPIContext *(*prepareAttachThread)(const CMPIBroker *broker, const CMPIContext *context);
    // First call in a thread of the provider's own, with the context made for it.
    CMPIStatus (*attachThread)(const CMPIBroker *broker, const CMPIContext *context);
    // Last call in that thread; it also ends the life of the context.
    CMPIStatus (*detachThread)(const CMPIBroker *broker, const CMPIContext *context);

    // -- Indications --
    CMPIStatus (*deliverIndication)(const CMPIBroker *broker, const CMPIContext *context,
                                    const char *name_space, const CMPIInstance *indication);

    // -- Instances --
    CMPIEnumeration *(*enumerateInstanceNames)(const CMPIBroker *broker, const CMPIContext *context,
                                               const CMPIObjectPath *class_path,
                                               CMPIStatus *status);
    CMPIInstance *(*getInstance)(const CMPIBroker *broker, const CMPIContext *context,
                                 const CMPIObjectPath *instance_path, const char **properties,
                                 CMPIStatus *status);
    CMPIObjectPath *(*createInstance)(const CMPIBroker *broker, const CMPIContext *context,
                                      const CMPIObjectPath *class_path,
                                      const CMPIInstance *instance, CMPIStatus *status);
    CMPIStatus (*modifyInstance)(const CMPIBroker *broker, const CMPIContext *context,
                                 const CMPIObjectPath *instance_path, const CMPIInstance *instance,
                                 const char **properties);
    CMPIStatus (*deleteInstance)(const CMPIBroker *broker, const CMPIContext *context,
                                 const CMPIObjectPath *instance_path);
    CMPIEnumeration *(*execQuery)(const CMPIBroker *broker, const CMPIContext *context,
                                  const CMPIObjectPath *class_path, const char *query,
                                  const char *language, CMPIStatus *status);
    CMPIEnumeration *(*enumerateInstances)(const CMPIBroker *broker, const CMPIContext *context,
                                           const CMPIObjectPath *class_path,
                                           const char **properties, CMPIStatus *status);

    // -- Associations --
    CMPIEnumeration *(*associators)(const CMPIBroker *broker, const CMPIContext *context,
                                    const CMPIObjectPath *instance_path, const char *assoc_class,
                                    const char *result_class, const char *role,
                                    const char *result_role, const char **properties,
                                    CMPIStatus *status);
    CMPIEnumeration *(*associatorNames)(const CMPIBroker *broker, const CMPIContext *context,
                                        const CMPIObjectPath *instance_path,
                                        const char *assoc_class, const char *result_class,
                                        const char *role, const char *result_role,
                                        CMPIStatus *status);
    CMPIEnumeration *(*references)(const CMPIBroker *broker, const CMPIContext *context,
                                   const CMPIObjectPath *instance_path, const char *result_class,
                                   const char *role, const char **properties, CMPIStatus *status);
    CMPIEnumeration *(*referenceNames)(const CMPIBroker *broker, const CMPIContext *context,
                                       const CMPIObjectPath *instance_path,
                                       const char *result_class, const char *role,
                                       CMPIStatus *status);

    // -- Methods and single properties --
    CMPIData (*invokeMethod)(const CMPIBroker *broker, const CMPIContext *context,
                             const CMPIObjectPath *target, const char *method, const CMPIArgs *in,
                             CMPIArgs *out, CMPIStatus *status);
    CMPIStatus (*setProperty)(const CMPIBroker *broker, const CMPIContext *context,
                              const CMPIObjectPath *instance_path, const char *name,
                              const CMPIValue *value, CMPIType type);
    CMPIData (*getProperty)(const CMPIBroker *broker, const CMPIContext *context,
                            const CMPIObjectPath *instance_path, const char *name,
                            CMPIStatus *status);
};

// Factories of the encapsulated objects, and the services that come with them. What a factory
// makes belongs to the broker, which frees it after the provider call or at the thread's end.
// Null in brokers of the sfcb kind: newCMPIError, openMessageFile, closeMessageFile, getMessage2.
// Their getMessage, logMessage and trace answer NOT_SUPPORTED.
struct _CMPIBrokerEncFT {
    int ftVersion;

    // -- Factories --
    CMPIInstance *(*newInstance)(const CMPIBroker *broker, const CMPIObjectPath *instance_path,
                                 CMPIStatus *status);
    CMPIObjectPath *(*newObjectPath)(const CMPIBroker *broker, const char *name_space,
                                     const char *class_name, CMPIStatus *status);
    CMPIArgs *(*newArgs)(const CMPIBroker *broker, CMPIStatus *status);
    CMPIString *(*newString)(const CMPIBroker *broker, const char *text, CMPIStatus *status);
    CMPIArray *(*newArray)(const CMPIBroker *broker, CMPICount count, CMPIType type,
                           CMPIStatus *status);
    CMPIDateTime *(*newDateTime)(const CMPIBroker *broker, CMPIStatus *status);
    // Microseconds since the epoch, or the length of an interval.
    CMPIDateTime *(*newDateTimeFromBinary)(const CMPIBroker *broker, CMPIUint64 microseconds,
                                           CMPIBoolean is_interval, CMPIStatus *status);
    // 25 characters: yyyymmddhhmmss.mmmmmmsutc or ddddddddhhmmss.mmmmmm:000 (DSP0004, 5.2.4).
    CMPIDateTime *(*newDateTimeFromChars)(const CMPIBroker *broker, const char *text,
                                          CMPIStatus *status);
    // `projection` receives the selected property names; may be null.
    CMPISelectExp *(*newSelectExp)(const CMPIBroker *broker, const char *query,
                                   const char *language, CMPIArray **projection,
                                   CMPIStatus *status);

    // -- Questions about objects --
    CMPIBoolean (*classPathIsA)(const CMPIBroker *broker, const CMPIObjectPath *class_path,
                                const char *class_name, CMPIStatus *status);
    // `object` is any encapsulated object; the form of the text is the broker's affair.
    CMPIString *(*toString)(const CMPIBroker *broker, const void *object, CMPIStatus *status);
    CMPIBoolean (*isOfType)(const CMPIBroker *broker, const void *object, const char *type_name,
                            CMPIStatus *status);
    CMPIString *(*getType)(const CMPIBroker *broker, const void *object, CMPIStatus *status);

    // -- Messages, log and trace --
    // `count` pairs of type code and value follow; the text names them $0 to $9.
    CMPIString *(*getMessage)(const CMPIBroker *broker, const char *id, const char *text,
                              CMPIStatus *status, CMPICount count, ...);
    CMPIStatus (*logMessage)(const CMPIBroker *broker, int severity, const char *id,
                             const char *text, const CMPIString *string);
    CMPIStatus (*trace)(const CMPIBroker *broker, int level, const char *component,
                        const char *text, const CMPIString *string);

    // -- Added in 2.0 --
    CMPIError *(*newCMPIError)(const CMPIBroker *broker, const char *owner, const char *id,
                               const char *message, CMPIErrorSeverity severity,
                               CMPIErrorProbableCause cause, CMPIrc rc, CMPIStatus *status);
    CMPIStatus (*openMessageFile)(const CMPIBroker *broker, const char *file,
                                  CMPIMsgFileHandle *handle);
    CMPIStatus (*closeMessageFile)(const CMPIBroker *broker, CMPIMsgFileHandle handle);
    CMPIString *(*getMessage2)(const CMPIBroker *broker, const char *id, CMPIMsgFileHandle handle,
                               const char *text, CMPIStatus *status, CMPICount count, ...);
};

// Threads, mutexes and conditions in the broker's own flavour. Results of type int are 0 or an
// errno value, as those of POSIX threads are.
// Null in brokers of the sfcb kind: joinThread, exitThread, cancelThread, threadSleep,
// signalCondition.
struct _CMPIBrokerExtFT {
    int ftVersion;

    char *(*resolveFileName)(const char *name);

    // -- Threads --
    CMPI_THREAD_TYPE (*newThread)(CMPI_THREAD_RETURN (*entry)(void *), void *user, int detached);
    int (*joinThread)(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN *exit_value);
    int (*exitThread)(CMPI_THREAD_RETURN exit_value);
    int (*cancelThread)(CMPI_THREAD_TYPE thread);
    int (*threadSleep)(CMPIUint32 milliseconds);

    // -- Thread-specific data --
    int (*threadOnce)(int *control, void (*init)());
    int (*createThreadKey)(CMPI_THREAD_KEY_TYPE *key, void (*cleanup)(void *));
    int (*destroyThreadKey)(CMPI_THREAD_KEY_TYPE key);
    void *(*getThreadSpecific)(CMPI_THREAD_KEY_TYPE key);
    int (*setThreadSpecific)(CMPI_THREAD_KEY_TYPE key, void *value);

    // -- Mutexes --
    CMPI_MUTEX_TYPE (*newMutex)(int options);
    void (*destroyMutex)(CMPI_MUTEX_TYPE mutex);
    void (*lockMutex)(CMPI_MUTEX_TYPE mutex);
    void (*unlockMutex)(CMPI_MUTEX_TYPE mutex);

    // -- Conditions --
    CMPI_COND_TYPE (*newCondition)(int options);
    void (*destroyCondition)(CMPI_COND_TYPE condition);
    int (*condWait)(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex);
    int (*timedCondWait)(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, ::timespec *deadline);
    int (*signalCondition)(CMPI_COND_TYPE condition);
};

// Memory under the broker's control. The whole table is absent (CMPIBroker::mft is null) in brokers
// of the sfcb kind.
struct _CMPIBrokerMemFT {
    int ftVersion;

    // -- Objects made since a mark can be freed together --
    CMPIGcStat *(*mark)(const CMPIBroker *broker, CMPIStatus *status);
    CMPIStatus (*release)(const CMPIBroker *broker, const CMPIGcStat *mark);

    // -- Raw memory, freed after the call like an object --
    void *(*cmpiMalloc)(const CMPIBroker *broker, std::size_t size);
    void *(*cmpiCalloc)(const CMPIBroker *broker, std::size_t count, std::size_t size);
    void *(*cmpiRealloc)(const CMPIBroker *broker, void *block, std::size_t size);
    char *(*cmpiStrDup)(const CMPIBroker *broker, const char *text);
    void (*cmpiFree)(const CMPIBroker *broker, void *block);

    // -- Early release of what a factory made --
    void (*freeInstance)(const CMPIBroker *broker, CMPIInstance *instance);
    void (*freeObjectPath)(const CMPIBroker *broker, CMPIObjectPath *path);
    void (*freeArgs)(const CMPIBroker *broker, CMPIArgs *args);
    void (*freeString)(const CMPIBroker *broker, CMPIString *string);
    void (*freeArray)(const CMPIBroker *broker, CMPIArray *array);
    void (*freeDateTime)(const CMPIBroker *broker, CMPIDateTime *date_time);
    void (*freeSelectExp)(const CMPIBroker *broker, CMPISelectExp *expression);
};

}  // extern "C"
