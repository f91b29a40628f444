#pragma once

// Questions about objects and values; the answers are 0 or 1.

#include "cmpi/detail/values.h"

// True for a null pointer and for an object that has nothing behind it, such as the null string.
template <class Object>
CMPIBoolean CMIsNullObject(const Object *object) {
    return static_cast<CMPIBoolean>(object == nullptr || object->hdl == nullptr);
}

// Means something only after a good status: an absent item need not be marked as null.
inline CMPIBoolean CMIsNullValue(const CMPIData &data) {
    return static_cast<CMPIBoolean>((data.state & CMPI_nullValue) != 0);
}

inline CMPIBoolean CMIsKeyValue(const CMPIData &data) {
    return static_cast<CMPIBoolean>((data.state & CMPI_keyValue) != 0);
}

inline CMPIBoolean CMIsArray(const CMPIData &data) {
    return static_cast<CMPIBoolean>((data.type & CMPI_ARRAY) != 0);
}
