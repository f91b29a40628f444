#pragma once

// Short forms for the slots of instances and object paths.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/object_tables.h"

// -- CMPIInstance --

inline CMPIData CMGetProperty(const CMPIInstance *instance, const char *name, CMPIStatus *status) {
    return instance->ft->getProperty(instance, name, status);
}

inline CMPIData CMGetPropertyAt(const CMPIInstance *instance, CMPICount index, CMPIString **name,
                                CMPIStatus *status) {
    return instance->ft->getPropertyAt(instance, index, name, status);
}

inline CMPICount CMGetPropertyCount(const CMPIInstance *instance, CMPIStatus *status) {
    return instance->ft->getPropertyCount(instance, status);
}

inline CMPIStatus CMSetProperty(const CMPIInstance *instance, const char *name,
                                const CMPIValue *value, CMPIType type) {
    return instance->ft->setProperty(instance, name, value, type);
}

inline CMPIObjectPath *CMGetObjectPath(const CMPIInstance *instance, CMPIStatus *status) {
    return instance->ft->getObjectPath(instance, status);
}

inline CMPIStatus CMSetPropertyFilter(CMPIInstance *instance, const char **properties,
                                      const char **keys) {
    return instance->ft->setPropertyFilter(instance, properties, keys);
}

inline CMPIStatus CMSetObjectPath(CMPIInstance *instance, const CMPIObjectPath *path) {
    return instance->ft->setObjectPath(instance, path);
}

inline CMPIStatus CMSetPropertyWithOrigin(const CMPIInstance *instance, const char *name,
                                          const CMPIValue *value, CMPIType type,
                                          const char *origin) {
    return instance->ft->setPropertyWithOrigin(instance, name, value, type, origin);
}

// -- CMPIObjectPath --

inline CMPIStatus CMSetNameSpace(CMPIObjectPath *path, const char *name_space) {
    return path->ft->setNameSpace(path, name_space);
}

inline CMPIString *CMGetNameSpace(const CMPIObjectPath *path, CMPIStatus *status) {
    return path->ft->getNameSpace(path, status);
}

inline CMPIStatus CMSetHostname(CMPIObjectPath *path, const char *host_name) {
    return path->ft->setHostname(path, host_name);
}

inline CMPIString *CMGetHostname(const CMPIObjectPath *path, CMPIStatus *status) {
    return path->ft->getHostname(path, status);
}

inline CMPIStatus CMSetClassName(CMPIObjectPath *path, const char *class_name) {
    return path->ft->setClassName(path, class_name);
}

inline CMPIString *CMGetClassName(const CMPIObjectPath *path, CMPIStatus *status) {
    return path->ft->getClassName(path, status);
}

inline CMPIStatus CMAddKey(CMPIObjectPath *path, const char *name, const CMPIValue *value,
                           CMPIType type) {
    return path->ft->addKey(path, name, value, type);
}

inline CMPIData CMGetKey(const CMPIObjectPath *path, const char *name, CMPIStatus *status) {
    return path->ft->getKey(path, name, status);
}

inline CMPIData CMGetKeyAt(const CMPIObjectPath *path, CMPICount index, CMPIString **name,
                           CMPIStatus *status) {
    return path->ft->getKeyAt(path, index, name, status);
}

inline CMPICount CMGetKeyCount(const CMPIObjectPath *path, CMPIStatus *status) {
    return path->ft->getKeyCount(path, status);
}

inline CMPIStatus CMSetNameSpaceFromObjectPath(CMPIObjectPath *path, const CMPIObjectPath *source) {
    return path->ft->setNameSpaceFromObjectPath(path, source);
}

inline CMPIStatus CMSetHostAndNameSpaceFromObjectPath(CMPIObjectPath *path,
                                                      const CMPIObjectPath *source) {
    return path->ft->setHostAndNameSpaceFromObjectPath(path, source);
}

inline CMPIData CMGetClassQualifier(const CMPIObjectPath *path, const char *qualifier,
                                    CMPIStatus *status) {
    return path->ft->getClassQualifier(path, qualifier, status);
}

inline CMPIData CMGetPropertyQualifier(const CMPIObjectPath *path, const char *name,
                                       const char *qualifier, CMPIStatus *status) {
    return path->ft->getPropertyQualifier(path, name, qualifier, status);
}

inline CMPIData CMGetMethodQualifier(const CMPIObjectPath *path, const char *method,
                                     const char *qualifier, CMPIStatus *status) {
    return path->ft->getMethodQualifier(path, method, qualifier, status);
}

inline CMPIData CMGetParameterQualifier(const CMPIObjectPath *path, const char *method,
                                        const char *name, const char *qualifier,
                                        CMPIStatus *status) {
    return path->ft->getParameterQualifier(path, method, name, qualifier, status);
}

// Not in the 2.1 edition.
inline CMPIString *CMObjectPathToString(const CMPIObjectPath *path, CMPIStatus *status) {
    return path->ft->toString(path, status);
}
