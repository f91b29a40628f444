// CMPISelectExp, its conditions in normal form, their rows and comparisons.
#include "host/broker/convert.h"

namespace velkhost::broker {
namespace {

Making tracked(const Tag &owner, const char *maker) {
    return {owner.core, Custody::kTracked, {maker, owner.origin.subject}, nullptr};
}

// -- Expression --

CMPIBoolean evaluate(const CMPISelectExp *expression, const CMPIInstance *instance,
                     CMPIStatus *status) {
    const auto *object = open(expression, "evaluate", status);
    const auto *subject = object != nullptr ? open(instance, "evaluate", status) : nullptr;
    if (subject == nullptr) {
        return 0;
    }
    const cim::Instance &content = subject->payload->instance;
    const query::IsA is_a = [&](std::string_view name, std::string_view ancestor) {
        return object->tag.core.repository.is_a(content.path.name_space, name, ancestor);
    };
    return query::matches(**object->payload, content, is_a) ? 1 : 0;
}

CMPIString *get_string(const CMPISelectExp *expression, CMPIStatus *status) {
    const auto *object = open(expression, "getString", status);
    return object != nullptr
               ? make_string(tracked(object->tag, "getString"), (*object->payload)->text)
               : nullptr;
}

template <bool disjunctive>
CMPISelectCond *get_condition(const CMPISelectExp *expression, CMPIStatus *status) {
    const char *maker = disjunctive ? "getDOC" : "getCOD";
    const auto *object = open(expression, maker, status);
    if (object == nullptr) {
        return nullptr;
    }
    std::optional<query::NormalForm> form = query::normal_form(**object->payload, disjunctive);
    if (!form) {
        set_status(status, CMPI_RC_ERR_FAILED);
        return nullptr;
    }
    return make<CMPISelectCond>(object->tag.core, Custody::kTracked,
                                {maker, object->tag.origin.subject},
                                {std::move(*form), disjunctive});
}

template <class Face>
CMPIBoolean refuse_accessor(const Face *, CMPIAccessor *, void *, CMPIStatus *status) {
    set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    return 0;
}

// -- Condition --

CMPICount get_count_and_type(const CMPISelectCond *condition, int *kind, CMPIStatus *status) {
    const auto *object = open(condition, "getCountAndType", status);
    if (object == nullptr) {
        return 0;
    }
    if (kind != nullptr) {
        *kind = object->payload->disjunctive ? CMPI_COND_DOC : CMPI_COND_COD;
    }
    return static_cast<CMPICount>(object->payload->form.size());
}

// An entry of a list as an object of its own; out of range: null with rc 1.
template <class Face, class Owner, class List>
Face *entry_at(const Object<Owner> *object, const List &list, CMPICount index, const char *maker,
               CMPIStatus *status) {
    if (index >= list.size()) {
        set_status(status, CMPI_RC_ERR_FAILED);
        return nullptr;
    }
    return make<Face>(object->tag.core, Custody::kTracked, {maker, object->tag.origin.subject},
                      list[index]);
}

CMPISubCond *get_sub_cond_at(const CMPISelectCond *condition, CMPICount index, CMPIStatus *status) {
    const auto *object = open(condition, "getSubCondAt", status);
    return object != nullptr
               ? entry_at<CMPISubCond>(object, object->payload->form, index, "getSubCondAt", status)
               : nullptr;
}

// -- Row --

CMPICount get_count(const CMPISubCond *condition, CMPIStatus *status) {
    const auto *object = open(condition, "getCount", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->size()) : 0;
}

CMPIPredicate *get_predicate_at(const CMPISubCond *condition, CMPICount index, CMPIStatus *status) {
    const auto *object = open(condition, "getPredicateAt", status);
    return object != nullptr
               ? entry_at<CMPIPredicate>(object, *object->payload, index, "getPredicateAt", status)
               : nullptr;
}

CMPIPredicate *refuse_predicate(const CMPISubCond *, const char *, CMPIStatus *status) {
    set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    return nullptr;
}

// -- Comparison --

CMPIStatus get_data(const CMPIPredicate *predicate, CMPIType *type, CMPIPredOp *op,
                    CMPIString **left, CMPIString **right) {
    CMPIStatus status{};
    const auto *object = open(predicate, "getData", &status);
    if (object == nullptr) {
        return status;
    }
    const query::Comparison &comparison = *object->payload;
    if (type != nullptr) {
        *type = comparison.literal_type;
    }
    if (op != nullptr) {
        *op = comparison.op;
    }
    if (left != nullptr) {
        *left = make_string(tracked(object->tag, "getData"), comparison.property);
    }
    if (right != nullptr) {
        *right = make_string(tracked(object->tag, "getData"), comparison.literal);
    }
    return status;
}

}  // namespace

const CMPISelectExpFT kSelectExpTable{
    .ftVersion = 1,
    .release = release<CMPISelectExp>,
    .clone = clone<CMPISelectExp>,
    .evaluate = evaluate,
    .getString = get_string,
    .getDOC = get_condition<true>,
    .getCOD = get_condition<false>,
    .evaluateUsingAccessor = refuse_accessor<CMPISelectExp>,
};

const CMPISelectCondFT kSelectCondTable{
    .ftVersion = 1,
    .release = release<CMPISelectCond>,
    .clone = clone<CMPISelectCond>,
    .getCountAndType = get_count_and_type,
    .getSubCondAt = get_sub_cond_at,
};

const CMPISubCondFT kSubCondTable{
    .ftVersion = 1,
    .release = release<CMPISubCond>,
    .clone = clone<CMPISubCond>,
    .getCount = get_count,
    .getPredicateAt = get_predicate_at,
    .getPredicate = refuse_predicate,
};

const CMPIPredicateFT kPredicateTable{
    .ftVersion = 1,
    .release = release<CMPIPredicate>,
    .clone = clone<CMPIPredicate>,
    .getData = get_data,
    .evaluateUsingAccessor = refuse_accessor<CMPIPredicate>,
};

}  // namespace velkhost::broker
