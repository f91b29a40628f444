#pragma once

// Table of the error object.

#include "cmpi/detail/error_enums.h"
#include "cmpi/detail/objects.h"
#include "cmpi/detail/probable_cause.h"

extern "C" {

// A CIM_Error instance with typed access. Brokers of the sfcb kind have no such objects
// (CMPIBrokerEncFT::newCMPIError is null).
struct _CMPIErrorFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIError *error);
    CMPIError *(*clone)(const CMPIError *error, CMPIStatus *status);

    // -- What the error says --
    CMPIErrorType (*getErrorType)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getOtherErrorType)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getOwningEntity)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getMessageID)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getMessage)(const CMPIError *error, CMPIStatus *status);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError *error, CMPIStatus *status);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getProbableCauseDescription)(const CMPIError *error, CMPIStatus *status);
    CMPIArray *(*getRecommendedActions)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getErrorSource)(const CMPIError *error, CMPIStatus *status);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getOtherErrorSourceFormat)(const CMPIError *error, CMPIStatus *status);
    CMPIrc (*getCIMStatusCode)(const CMPIError *error, CMPIStatus *status);
    CMPIString *(*getCIMStatusCodeDescription)(const CMPIError *error, CMPIStatus *status);
    CMPIArray *(*getMessageArguments)(const CMPIError *error, CMPIStatus *status);

    // -- The optional parts --
    CMPIStatus (*setErrorType)(CMPIError *error, CMPIErrorType type);
    CMPIStatus (*setOtherErrorType)(CMPIError *error, const char *text);
    CMPIStatus (*setProbableCauseDescription)(CMPIError *error, const char *text);
    CMPIStatus (*setRecommendedActions)(CMPIError *error, const CMPIArray *strings);
    CMPIStatus (*setErrorSource)(CMPIError *error, const char *text);
    CMPIStatus (*setErrorSourceFormat)(CMPIError *error, CMPIErrorSrcFormat format);
    CMPIStatus (*setOtherErrorSourceFormat)(CMPIError *error, const char *text);
    CMPIStatus (*setCIMStatusCodeDescription)(CMPIError *error, const char *text);
    CMPIStatus (*setMessageArguments)(CMPIError *error, CMPIArray *strings);
};

}  // extern "C"
