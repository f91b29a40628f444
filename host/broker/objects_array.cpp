// CMPIArray and CMPIEnumeration. A tracked array holds the objects that were put in; what a clone
// holds is its own.
#include "host/broker/convert.h"

#include <utility>

namespace velkhost::broker {
namespace {

// -- Array --

CMPIArray *clone_array(const CMPIArray *array, CMPIStatus *status) {
    auto *object = open(array, "clone", status);
    if (object == nullptr) {
        return nullptr;
    }
    const Making making{
        object->tag.core, Custody::kClone, {"clone", object->tag.origin.subject}, nullptr};
    return to_data(making, array_value(*object->payload)).value.array;
}

CMPICount get_size(const CMPIArray *array, CMPIStatus *status) {
    const auto *object = open(array, "getSize", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->elements.size()) : 0;
}

CMPIType get_simple_type(const CMPIArray *array, CMPIStatus *status) {
    const auto *object = open(array, "getSimpleType", status);
    return object != nullptr ? object->payload->element_type : CMPI_null;
}

CMPIData bad_element(CMPIType type) {
    CMPIData data{};
    data.type = type;
    data.state = CMPI_badValue;
    return data;
}

CMPIData get_element_at(const CMPIArray *array, CMPICount index, CMPIStatus *status) {
    const auto *object = open(array, "getElementAt", status);
    if (object == nullptr) {
        return bad_element(CMPI_null);
    }
    const ArrayPayload &payload = *object->payload;
    return index < payload.elements.size() ? payload.elements[index]
                                           : bad_element(payload.element_type);
}

// The element to store, or nothing if its type does not fit.
std::optional<CMPIData> element_of(Object<CMPIArray> &array, const CMPIValue *value,
                                   CMPIType type) {
    ArrayPayload &payload = *array.payload;
    const bool text = type == CMPI_chars && payload.element_type == CMPI_string;
    if (type != payload.element_type && !text) {
        return std::nullopt;
    }
    CMPIData data{};
    data.type = payload.element_type;
    if (value == nullptr) {
        data.state = CMPI_nullValue;
    } else if (text) {
        const Making making{array.tag.core, Custody::kPart, {"setElementAt", ""}, &payload.parts};
        data.value.string = make_string(making, reinterpret_cast<const char *>(value));
    } else {
        data.value = *value;
        const bool empty = (type & CMPI_ENC) != 0 && value->string == nullptr;
        data.state = empty ? CMPI_nullValue : CMPI_goodValue;
    }
    return data;
}

CMPIStatus set_element_at(CMPIArray *array, CMPICount index, const CMPIValue *value,
                          CMPIType type) {
    CMPIStatus status{};
    auto *object = open(array, "setElementAt", &status);
    if (object == nullptr) {
        return status;
    }
    ArrayPayload &payload = *object->payload;
    const bool grows = payload.may_grow && index == payload.elements.size();
    if (index >= payload.elements.size() && !grows) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
    const std::optional<CMPIData> element = element_of(*object, value, type);
    if (!element) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
    if (grows) {
        payload.elements.push_back(*element);
    } else {
        payload.elements[index] = *element;
    }
    return status;
}

// -- Enumeration --

CMPIEnumeration *clone_enumeration(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    auto *object = open(enumeration, "clone", status);
    const auto *array = object != nullptr ? open(object->payload->elements, "clone") : nullptr;
    if (array == nullptr) {
        return nullptr;
    }
    const Making making{
        object->tag.core, Custody::kClone, {"clone", object->tag.origin.subject}, nullptr};
    Object<CMPIEnumeration> *copy = make_enumeration(making, array_value(*array->payload));
    copy->payload->next = object->payload->next;
    return copy;
}

CMPIBoolean has_next(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    const auto *object = open(enumeration, "hasNext", status);
    const bool more =
        object != nullptr && object->payload->next < get_size(object->payload->elements, nullptr);
    return more ? 1 : 0;
}

CMPIData get_next(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    auto *object = open(enumeration, "getNext", status);
    if (object == nullptr) {
        return bad_element(CMPI_null);
    }
    const CMPIData data = get_element_at(object->payload->elements, object->payload->next, status);
    object->payload->next += (data.state & CMPI_badValue) == 0 ? 1 : 0;
    return data;
}

CMPIArray *to_array(const CMPIEnumeration *enumeration, CMPIStatus *status) {
    const auto *object = open(enumeration, "toArray", status);
    return object != nullptr ? object->payload->elements : nullptr;
}

}  // namespace

Object<CMPIEnumeration> *make_enumeration(const Making &making, const cim::Value &elements) {
    EnumerationPayload payload;
    const Making inner{making.core, Custody::kPart, making.origin, &payload.parts};
    payload.elements = to_data(inner, elements).value.array;
    return make<CMPIEnumeration>(making.core, making.custody, making.origin, std::move(payload));
}

const CMPIArrayFT kArrayTable{
    .ftVersion = 1,
    .release = release<CMPIArray>,
    .clone = clone_array,
    .getSize = get_size,
    .getSimpleType = get_simple_type,
    .getElementAt = get_element_at,
    .setElementAt = set_element_at,
};

const CMPIEnumerationFT kEnumerationTable{
    .ftVersion = 1,
    .release = release<CMPIEnumeration>,
    .clone = clone_enumeration,
    .getNext = get_next,
    .hasNext = has_next,
    .toArray = to_array,
};

}  // namespace velkhost::broker
