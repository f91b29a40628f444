#pragma once

// Release and clone for every encapsulated object. Neither checks for null.

#include "cmpi/detail/values.h"

// Ends the life of a clone. What a factory or a getter gave belongs to the broker.
template <class Object>
CMPIStatus CMRelease(Object *object) {
    return object->ft->release(object);
}

// A copy that outlives the request; the caller releases it once. Null on failure.
template <class Object>
auto CMClone(const Object *object, CMPIStatus *status) {
    return object->ft->clone(object, status);
}
