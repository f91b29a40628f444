#pragma once

// The encapsulated objects: what their maker keeps (`hdl`, opaque to everybody else), then the
// table of their functions. Makers may keep more behind these two, so objects are never copied by
// value.

#include "cmpi/detail/forward.h"
#include "cmpi/detail/values.h"

extern "C" {

// Circumstances of a request, as named values.
struct _CMPIContext {
    void *hdl;
    CMPIContextFT *ft;
};

// Takes what a provider answers.
struct _CMPIResult {
    void *hdl;
    CMPIResultFT *ft;
};

// A text. `hdl` is the text itself in many brokers; null there means the null string.
struct _CMPIString {
    void *hdl;
    CMPIStringFT *ft;
};

// Elements of one type.
struct _CMPIArray {
    void *hdl;
    CMPIArrayFT *ft;
};

// A sequence of instances or paths.
struct _CMPIEnumeration {
    void *hdl;
    CMPIEnumerationFT *ft;
};

// An instance.
struct _CMPIInstance {
    void *hdl;
    CMPIInstanceFT *ft;
};

// Name of a class or an instance.
struct _CMPIObjectPath {
    void *hdl;
    CMPIObjectPathFT *ft;
};

// Parameters of a method.
struct _CMPIArgs {
    void *hdl;
    CMPIArgsFT *ft;
};

// A point in time or an interval.
struct _CMPIDateTime {
    void *hdl;
    CMPIDateTimeFT *ft;
};

// A parsed query.
struct _CMPISelectExp {
    void *hdl;
    CMPISelectExpFT *ft;
};

// Its condition in a normal form.
struct _CMPISelectCond {
    void *hdl;
    CMPISelectCondFT *ft;
};

// One row of that form.
struct _CMPISubCond {
    void *hdl;
    CMPISubCondFT *ft;
};

// One comparison of that row.
struct _CMPIPredicate {
    void *hdl;
    CMPIPredicateFT *ft;
};

// An instance of CIM_Error.
struct _CMPIError {
    void *hdl;
    CMPIErrorFT *ft;
};

// -- Provider objects, one per kind; `hdl` is free for the provider --

struct _CMPIInstanceMI {
    const void *hdl;
    CMPIInstanceMIFT *ft;
};

struct _CMPIAssociationMI {
    void *hdl;
    CMPIAssociationMIFT *ft;
};

struct _CMPIMethodMI {
    void *hdl;
    CMPIMethodMIFT *ft;
};

struct _CMPIPropertyMI {
    void *hdl;
    CMPIPropertyMIFT *ft;
};

struct _CMPIIndicationMI {
    void *hdl;
    CMPIIndicationMIFT *ft;
};

}  // extern "C"
