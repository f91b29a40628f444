#pragma once

// Values that cross the interface, and the status of a call.

#include "cmpi/detail/forward.h"
#include "cmpi/detail/scalars.h"
#include "cmpi/detail/status_codes.h"
#include "cmpi/detail/type_codes.h"

extern "C" {

// A block of memory as a value. Ownership is agreed on by those who exchange it.
struct _CMPIValuePtr {
    void *ptr;
    CMPICount length;  // bytes
};
using CMPIValuePtr = _CMPIValuePtr;

// The type code beside the value says which member is meant: the one of the same name, `array`
// for every code with CMPI_ARRAY, `inst` for CMPI_instance, `dataPtr` for CMPI_ptr.
union _CMPIValue {
    CMPIUint64 uint64;
    CMPIUint32 uint32;
    CMPIUint16 uint16;
    CMPIUint8 uint8;

    CMPISint64 sint64;
    CMPISint32 sint32;
    CMPISint16 sint16;
    CMPISint8 sint8;

    CMPIReal64 real64;
    CMPIReal32 real32;

    CMPIBoolean boolean;
    CMPIChar16 char16;

    CMPIInstance *inst;
    CMPIObjectPath *ref;
    CMPIArgs *args;
    CMPISelectExp *filter;
    CMPIEnumeration *Enum;
    CMPIArray *array;
    CMPIString *string;
    char *chars;
    CMPIDateTime *dateTime;
    CMPIValuePtr dataPtr;

    // Older names of the signed integers and the reals.
    CMPISint8 Byte;
    CMPISint16 Short;
    CMPISint32 Int;
    CMPISint64 Long;
    CMPIReal32 Float;
    CMPIReal64 Double;
};

// A value with its type. `state` 0 is a good value.
struct _CMPIData {
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
};

// Outcome of a call. `msg` may be null.
struct _CMPIStatus {
    CMPIrc rc;
    CMPIString *msg;
};
using CMPIStatus = _CMPIStatus;

// Gives a query the properties of something that is no instance; `user` is handed through.
using CMPIAccessor = CMPIData(const char *name, void *user);

}  // extern "C"

// Bits of CMPIData::state. CMPI_notFound and CMPI_badValue do not imply CMPI_nullValue.
inline constexpr CMPIValueState CMPI_goodValue = 0;
inline constexpr CMPIValueState CMPI_nullValue = 1U << 8U;
inline constexpr CMPIValueState CMPI_keyValue = 2U << 8U;
inline constexpr CMPIValueState CMPI_notFound = 4U << 8U;
inline constexpr CMPIValueState CMPI_badValue = 0x80U << 8U;
