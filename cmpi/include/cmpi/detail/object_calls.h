#pragma once

// Short forms for the slots of context, result, text, array, sequence, arguments and time.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/object_tables.h"

// -- CMPIContext --

inline CMPIData CMGetContextEntry(const CMPIContext *context, const char *name,
                                  CMPIStatus *status) {
    return context->ft->getEntry(context, name, status);
}

inline CMPIData CMGetContextEntryAt(const CMPIContext *context, CMPICount index, CMPIString **name,
                                    CMPIStatus *status) {
    return context->ft->getEntryAt(context, index, name, status);
}

inline CMPICount CMGetContextEntryCount(const CMPIContext *context, CMPIStatus *status) {
    return context->ft->getEntryCount(context, status);
}

inline CMPIStatus CMAddContextEntry(const CMPIContext *context, const char *name,
                                    const CMPIValue *value, CMPIType type) {
    return context->ft->addEntry(context, name, value, type);
}

// -- CMPIResult --

inline CMPIStatus CMReturnData(const CMPIResult *result, const CMPIValue *value, CMPIType type) {
    return result->ft->returnData(result, value, type);
}

inline CMPIStatus CMReturnInstance(const CMPIResult *result, const CMPIInstance *instance) {
    return result->ft->returnInstance(result, instance);
}

inline CMPIStatus CMReturnObjectPath(const CMPIResult *result, const CMPIObjectPath *path) {
    return result->ft->returnObjectPath(result, path);
}

inline CMPIStatus CMReturnDone(const CMPIResult *result) {
    return result->ft->returnDone(result);
}

inline CMPIStatus CMReturnError(const CMPIResult *result, const CMPIError *error) {
    return result->ft->returnError(result, error);
}

// -- CMPIString --

inline const char *CMGetCharsPtr(const CMPIString *string, CMPIStatus *status) {
    return string->ft->getCharPtr(string, status);
}

// Without a status.
inline const char *CMGetCharPtr(const CMPIString *string) {
    return CMGetCharsPtr(string, nullptr);
}

// -- CMPIArray --

inline CMPICount CMGetArrayCount(const CMPIArray *array, CMPIStatus *status) {
    return array->ft->getSize(array, status);
}

inline CMPIType CMGetArrayType(const CMPIArray *array, CMPIStatus *status) {
    return array->ft->getSimpleType(array, status);
}

inline CMPIData CMGetArrayElementAt(const CMPIArray *array, CMPICount index, CMPIStatus *status) {
    return array->ft->getElementAt(array, index, status);
}

inline CMPIStatus CMSetArrayElementAt(CMPIArray *array, CMPICount index, const CMPIValue *value,
                                      CMPIType type) {
    return array->ft->setElementAt(array, index, value, type);
}

// -- CMPIEnumeration --

inline CMPIData CMGetNext(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    return enumeration->ft->getNext(enumeration, status);
}

inline CMPIBoolean CMHasNext(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    return enumeration->ft->hasNext(enumeration, status);
}

inline CMPIArray *CMToArray(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    return enumeration->ft->toArray(enumeration, status);
}

// -- CMPIArgs --

inline CMPIStatus CMAddArg(const CMPIArgs *args, const char *name, const CMPIValue *value,
                           CMPIType type) {
    return args->ft->addArg(args, name, value, type);
}

inline CMPIData CMGetArg(const CMPIArgs *args, const char *name, CMPIStatus *status) {
    return args->ft->getArg(args, name, status);
}

inline CMPIData CMGetArgAt(const CMPIArgs *args, CMPICount index, CMPIString **name,
                           CMPIStatus *status) {
    return args->ft->getArgAt(args, index, name, status);
}

inline CMPICount CMGetArgCount(const CMPIArgs *args, CMPIStatus *status) {
    return args->ft->getArgCount(args, status);
}

// -- CMPIDateTime --

inline CMPIUint64 CMGetBinaryFormat(const CMPIDateTime *date_time, CMPIStatus *status) {
    return date_time->ft->getBinaryFormat(date_time, status);
}

inline CMPIString *CMGetStringFormat(const CMPIDateTime *date_time, CMPIStatus *status) {
    return date_time->ft->getStringFormat(date_time, status);
}

inline CMPIBoolean CMIsInterval(const CMPIDateTime *date_time, CMPIStatus *status) {
    return date_time->ft->isInterval(date_time, status);
}
