#pragma once

// Tables of the encapsulated objects that carry data: context, result, text, array, sequence,
// instance, path, arguments, time.

#include "cmpi/detail/objects.h"

extern "C" {

// Named values that travel with a request. Entry names are compared with regard to case.
// No empty slot in brokers of the sfcb kind, but clone answers null and NOT_SUPPORTED there:
// use prepareAttachThread.
struct _CMPIContextFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIContext *context);
    CMPIContext *(*clone)(const CMPIContext *context, CMPIStatus *status);

    CMPIData (*getEntry)(const CMPIContext *context, const char *name, CMPIStatus *status);
    // Only below getEntryCount; `name` may be null.
    CMPIData (*getEntryAt)(const CMPIContext *context, CMPICount index, CMPIString **name,
                           CMPIStatus *status);
    CMPICount (*getEntryCount)(const CMPIContext *context, CMPIStatus *status);
    // Adds, or replaces the entry of that name.
    CMPIStatus (*addEntry)(const CMPIContext *context, const char *name, const CMPIValue *value,
                           CMPIType type);
};

// Where a provider puts what a request asks for. Brokers of the sfcb kind leave returnError null.
struct _CMPIResultFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIResult *result);
    CMPIResult *(*clone)(const CMPIResult *result, CMPIStatus *status);

    // The value of a method; brokers of the sfcb kind abort on CMPI_ref.
    CMPIStatus (*returnData)(const CMPIResult *result, const CMPIValue *value, CMPIType type);
    CMPIStatus (*returnInstance)(const CMPIResult *result, const CMPIInstance *instance);
    CMPIStatus (*returnObjectPath)(const CMPIResult *result, const CMPIObjectPath *path);
    CMPIStatus (*returnDone)(const CMPIResult *result);
    CMPIStatus (*returnError)(const CMPIResult *result, const CMPIError *error);
};

// A text that the broker owns. No empty slot in brokers of the sfcb kind.
struct _CMPIStringFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIString *string);
    CMPIString *(*clone)(const CMPIString *string, CMPIStatus *status);

    // Lives as long as the string; null for the null string.
    const char *(*getCharPtr)(const CMPIString *string, CMPIStatus *status);
};

// A fixed number of elements of one type. No empty slot in brokers of the sfcb kind.
struct _CMPIArrayFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIArray *array);
    CMPIArray *(*clone)(const CMPIArray *array, CMPIStatus *status);

    CMPICount (*getSize)(const CMPIArray *array, CMPIStatus *status);
    // Code of an element, without CMPI_ARRAY.
    CMPIType (*getSimpleType)(const CMPIArray *array, CMPIStatus *status);
    CMPIData (*getElementAt)(const CMPIArray *array, CMPICount index, CMPIStatus *status);
    CMPIStatus (*setElementAt)(CMPIArray *array, CMPICount index, const CMPIValue *value,
                               CMPIType type);
};

// A sequence that is read once, front to back. No empty slot in brokers of the sfcb kind.
struct _CMPIEnumerationFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIEnumeration *enumeration);
    CMPIEnumeration *(*clone)(const CMPIEnumeration *enumeration, CMPIStatus *status);

    CMPIData (*getNext)(const CMPIEnumeration *enumeration, CMPIStatus *status);
    CMPIBoolean (*hasNext)(const CMPIEnumeration *enumeration, CMPIStatus *status);
    // What is left, as an array; may be an inner part of the enumeration.
    CMPIArray *(*toArray)(const CMPIEnumeration *enumeration, CMPIStatus *status);
};

// Properties of one object. Brokers of the sfcb kind leave setPropertyWithOrigin null.
struct _CMPIInstanceFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIInstance *instance);
    CMPIInstance *(*clone)(const CMPIInstance *instance, CMPIStatus *status);

    CMPIData (*getProperty)(const CMPIInstance *instance, const char *name, CMPIStatus *status);
    // Only below getPropertyCount; `name` may be null.
    CMPIData (*getPropertyAt)(const CMPIInstance *instance, CMPICount index, CMPIString **name,
                              CMPIStatus *status);
    CMPICount (*getPropertyCount)(const CMPIInstance *instance, CMPIStatus *status);
    CMPIStatus (*setProperty)(const CMPIInstance *instance, const char *name,
                              const CMPIValue *value, CMPIType type);
    CMPIObjectPath *(*getObjectPath)(const CMPIInstance *instance, CMPIStatus *status);
    // Keeps only what is in either list; null keeps all.
    CMPIStatus (*setPropertyFilter)(CMPIInstance *instance, const char **properties,
                                    const char **keys);
    CMPIStatus (*setObjectPath)(CMPIInstance *instance, const CMPIObjectPath *path);
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance *instance, const char *name,
                                        const CMPIValue *value, CMPIType type, const char *origin);
};

// Name of a class or an instance: host, namespace, class, key bindings.
// Null in brokers of the sfcb kind: getClassQualifier, getMethodQualifier, getParameterQualifier.
struct _CMPIObjectPathFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIObjectPath *path);
    CMPIObjectPath *(*clone)(const CMPIObjectPath *path, CMPIStatus *status);

    // -- Where and what --
    CMPIStatus (*setNameSpace)(CMPIObjectPath *path, const char *name_space);
    CMPIString *(*getNameSpace)(const CMPIObjectPath *path, CMPIStatus *status);
    CMPIStatus (*setHostname)(CMPIObjectPath *path, const char *host_name);
    CMPIString *(*getHostname)(const CMPIObjectPath *path, CMPIStatus *status);
    CMPIStatus (*setClassName)(CMPIObjectPath *path, const char *class_name);
    CMPIString *(*getClassName)(const CMPIObjectPath *path, CMPIStatus *status);

    // -- Key bindings --
    CMPIStatus (*addKey)(CMPIObjectPath *path, const char *name, const CMPIValue *value,
                         CMPIType type);
    CMPIData (*getKey)(const CMPIObjectPath *path, const char *name, CMPIStatus *status);
    // Only below getKeyCount; `name` may be null.
    CMPIData (*getKeyAt)(const CMPIObjectPath *path, CMPICount index, CMPIString **name,
                         CMPIStatus *status);
    CMPICount (*getKeyCount)(const CMPIObjectPath *path, CMPIStatus *status);

    // -- Copies from another path --
    CMPIStatus (*setNameSpaceFromObjectPath)(CMPIObjectPath *path, const CMPIObjectPath *source);
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(CMPIObjectPath *path,
                                                    const CMPIObjectPath *source);

    // -- Qualifiers of the schema --
    CMPIData (*getClassQualifier)(const CMPIObjectPath *path, const char *qualifier,
                                  CMPIStatus *status);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath *path, const char *name,
                                     const char *qualifier, CMPIStatus *status);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath *path, const char *method,
                                   const char *qualifier, CMPIStatus *status);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath *path, const char *method,
                                      const char *name, const char *qualifier, CMPIStatus *status);

    CMPIString *(*toString)(const CMPIObjectPath *path, CMPIStatus *status);
};

// Named method parameters. No empty slot in brokers of the sfcb kind.
struct _CMPIArgsFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIArgs *args);
    CMPIArgs *(*clone)(const CMPIArgs *args, CMPIStatus *status);

    CMPIStatus (*addArg)(const CMPIArgs *args, const char *name, const CMPIValue *value,
                         CMPIType type);
    CMPIData (*getArg)(const CMPIArgs *args, const char *name, CMPIStatus *status);
    // Only below getArgCount; `name` may be null.
    CMPIData (*getArgAt)(const CMPIArgs *args, CMPICount index, CMPIString **name,
                         CMPIStatus *status);
    CMPICount (*getArgCount)(const CMPIArgs *args, CMPIStatus *status);
};

// A point in time or an interval. No empty slot in brokers of the sfcb kind.
struct _CMPIDateTimeFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIDateTime *date_time);
    CMPIDateTime *(*clone)(const CMPIDateTime *date_time, CMPIStatus *status);

    // Microseconds since the epoch, or the length of an interval.
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime *date_time, CMPIStatus *status);
    CMPIString *(*getStringFormat)(const CMPIDateTime *date_time, CMPIStatus *status);
    CMPIBoolean (*isInterval)(const CMPIDateTime *date_time, CMPIStatus *status);
};

}  // extern "C"
