#pragma once

// Short forms for the slots of parsed queries.
// Each calls the slot of the same meaning with the same arguments. None checks for null objects,
// tables or slots.

#include "cmpi/detail/query_tables.h"

// -- CMPISelectExp --

inline CMPIBoolean CMEvaluateSelExp(const CMPISelectExp *expression, const CMPIInstance *instance,
                                    CMPIStatus *status) {
    return expression->ft->evaluate(expression, instance, status);
}

inline CMPIString *CMGetSelExpString(const CMPISelectExp *expression, CMPIStatus *status) {
    return expression->ft->getString(expression, status);
}

inline CMPISelectCond *CMGetDoc(const CMPISelectExp *expression, CMPIStatus *status) {
    return expression->ft->getDOC(expression, status);
}

inline CMPISelectCond *CMGetCod(const CMPISelectExp *expression, CMPIStatus *status) {
    return expression->ft->getCOD(expression, status);
}

inline CMPIBoolean CMEvaluateSelExpUsingAccessor(const CMPISelectExp *expression,
                                                 CMPIAccessor *accessor, void *user,
                                                 CMPIStatus *status) {
    return expression->ft->evaluateUsingAccessor(expression, accessor, user, status);
}

// -- CMPISelectCond --

inline CMPICount CMGetSubCondCountAndType(const CMPISelectCond *condition, int *kind,
                                          CMPIStatus *status) {
    return condition->ft->getCountAndType(condition, kind, status);
}

inline CMPISubCond *CMGetSubCondAt(const CMPISelectCond *condition, CMPICount index,
                                   CMPIStatus *status) {
    return condition->ft->getSubCondAt(condition, index, status);
}

// -- CMPISubCond --

inline CMPICount CMGetPredicateCount(const CMPISubCond *condition, CMPIStatus *status) {
    return condition->ft->getCount(condition, status);
}

inline CMPIPredicate *CMGetPredicateAt(const CMPISubCond *condition, CMPICount index,
                                       CMPIStatus *status) {
    return condition->ft->getPredicateAt(condition, index, status);
}

inline CMPIPredicate *CMGetPredicate(const CMPISubCond *condition, const char *name,
                                     CMPIStatus *status) {
    return condition->ft->getPredicate(condition, name, status);
}

// -- CMPIPredicate --

inline CMPIStatus CMGetPredicateData(const CMPIPredicate *predicate, CMPIType *type, CMPIPredOp *op,
                                     CMPIString **left, CMPIString **right) {
    return predicate->ft->getData(predicate, type, op, left, right);
}

inline CMPIBoolean CMEvaluatePredicateUsingAccessor(const CMPIPredicate *predicate,
                                                    CMPIAccessor *accessor, void *user,
                                                    CMPIStatus *status) {
    return predicate->ft->evaluateUsingAccessor(predicate, accessor, user, status);
}
