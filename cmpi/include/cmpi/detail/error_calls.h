#pragma once

// Short forms for the slots of error objects.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/error_table.h"

inline CMPIErrorType CMGetErrorType(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getErrorType(error, status);
}

inline CMPIString *CMGetOtherErrorType(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getOtherErrorType(error, status);
}

inline CMPIString *CMGetOwningEntity(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getOwningEntity(error, status);
}

inline CMPIString *CMGetMessageID(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getMessageID(error, status);
}

inline CMPIString *CMGetErrorMessage(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getMessage(error, status);
}

inline CMPIErrorSeverity CMGetPerceivedSeverity(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getPerceivedSeverity(error, status);
}

inline CMPIErrorProbableCause CMGetProbableCause(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getProbableCause(error, status);
}

inline CMPIString *CMGetProbableCauseDescription(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getProbableCauseDescription(error, status);
}

inline CMPIArray *CMGetRecommendedActions(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getRecommendedActions(error, status);
}

inline CMPIString *CMGetErrorSource(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getErrorSource(error, status);
}

inline CMPIErrorSrcFormat CMGetErrorSourceFormat(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getErrorSourceFormat(error, status);
}

inline CMPIString *CMGetOtherErrorSourceFormat(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getOtherErrorSourceFormat(error, status);
}

inline CMPIrc CMGetCIMStatusCode(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getCIMStatusCode(error, status);
}

inline CMPIString *CMGetCIMStatusCodeDescription(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getCIMStatusCodeDescription(error, status);
}

inline CMPIArray *CMGetMessageArguments(const CMPIError *error, CMPIStatus *status) {
    return error->ft->getMessageArguments(error, status);
}

inline CMPIStatus CMSetErrorType(CMPIError *error, CMPIErrorType type) {
    return error->ft->setErrorType(error, type);
}

inline CMPIStatus CMSetOtherErrorType(CMPIError *error, const char *text) {
    return error->ft->setOtherErrorType(error, text);
}

inline CMPIStatus CMSetProbableCauseDescription(CMPIError *error, const char *text) {
    return error->ft->setProbableCauseDescription(error, text);
}

inline CMPIStatus CMSetRecommendedActions(CMPIError *error, const CMPIArray *strings) {
    return error->ft->setRecommendedActions(error, strings);
}

inline CMPIStatus CMSetErrorSource(CMPIError *error, const char *text) {
    return error->ft->setErrorSource(error, text);
}

inline CMPIStatus CMSetErrorSourceFormat(CMPIError *error, CMPIErrorSrcFormat format) {
    return error->ft->setErrorSourceFormat(error, format);
}

inline CMPIStatus CMSetOtherErrorSourceFormat(CMPIError *error, const char *text) {
    return error->ft->setOtherErrorSourceFormat(error, text);
}

inline CMPIStatus CMSetCIMStatusCodeDescription(CMPIError *error, const char *text) {
    return error->ft->setCIMStatusCodeDescription(error, text);
}

inline CMPIStatus CMSetMessageArguments(CMPIError *error, CMPIArray *strings) {
    return error->ft->setMessageArguments(error, strings);
}
