#pragma once

// Tables of parsed queries: expression, condition, row, comparison.

#include "cmpi/detail/enums.h"
#include "cmpi/detail/objects.h"

extern "C" {

// A query, parsed. No empty slot in brokers of the sfcb kind; evaluateUsingAccessor answers
// NOT_SUPPORTED there.
struct _CMPISelectExpFT {
    int ftVersion;

    CMPIStatus (*release)(CMPISelectExp *expression);
    CMPISelectExp *(*clone)(const CMPISelectExp *expression, CMPIStatus *status);

    CMPIBoolean (*evaluate)(const CMPISelectExp *expression, const CMPIInstance *instance,
                            CMPIStatus *status);
    CMPIString *(*getString)(const CMPISelectExp *expression, CMPIStatus *status);
    CMPISelectCond *(*getDOC)(const CMPISelectExp *expression, CMPIStatus *status);
    CMPISelectCond *(*getCOD)(const CMPISelectExp *expression, CMPIStatus *status);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp *expression, CMPIAccessor *accessor,
                                         void *user, CMPIStatus *status);
};

// The condition of a query in a normal form. No empty slot in brokers of the sfcb kind.
struct _CMPISelectCondFT {
    int ftVersion;

    CMPIStatus (*release)(CMPISelectCond *condition);
    CMPISelectCond *(*clone)(const CMPISelectCond *condition, CMPIStatus *status);

    // `kind` receives a CMPISelectCondType.
    CMPICount (*getCountAndType)(const CMPISelectCond *condition, int *kind, CMPIStatus *status);
    CMPISubCond *(*getSubCondAt)(const CMPISelectCond *condition, CMPICount index,
                                 CMPIStatus *status);
};

// One row of a normal form. No empty slot in brokers of the sfcb kind; getPredicate answers
// NOT_SUPPORTED there.
struct _CMPISubCondFT {
    int ftVersion;

    CMPIStatus (*release)(CMPISubCond *condition);
    CMPISubCond *(*clone)(const CMPISubCond *condition, CMPIStatus *status);

    CMPICount (*getCount)(const CMPISubCond *condition, CMPIStatus *status);
    CMPIPredicate *(*getPredicateAt)(const CMPISubCond *condition, CMPICount index,
                                     CMPIStatus *status);
    CMPIPredicate *(*getPredicate)(const CMPISubCond *condition, const char *name,
                                   CMPIStatus *status);
};

// One comparison. No empty slot in brokers of the sfcb kind; evaluateUsingAccessor answers
// NOT_SUPPORTED there.
struct _CMPIPredicateFT {
    int ftVersion;

    CMPIStatus (*release)(CMPIPredicate *predicate);
    CMPIPredicate *(*clone)(const CMPIPredicate *predicate, CMPIStatus *status);

    CMPIStatus (*getData)(const CMPIPredicate *predicate, CMPIType *type, CMPIPredOp *op,
                          CMPIString **left, CMPIString **right);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate *predicate, CMPIAccessor *accessor,
                                         void *user, CMPIStatus *status);
};

}  // extern "C"
