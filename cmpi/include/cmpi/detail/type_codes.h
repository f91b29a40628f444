#pragma once

// Type codes of values (CMPIData::type). An array has the code of its element with CMPI_ARRAY set.

#include "cmpi/detail/scalars.h"

inline constexpr CMPIType CMPI_null = 0x0000;

// -- Masks of the groups. CMPI_UINT and CMPI_SINT share a bit: both hit every integer --
inline constexpr CMPIType CMPI_SIMPLE = 0x0002;
inline constexpr CMPIType CMPI_REAL = 0x0008;
inline constexpr CMPIType CMPI_UINT = 0x0080;
inline constexpr CMPIType CMPI_SINT = 0x00C0;
inline constexpr CMPIType CMPI_INTEGER = CMPI_UINT | CMPI_SINT;
inline constexpr CMPIType CMPI_ENC = 0x1000;
inline constexpr CMPIType CMPI_ARRAY = 0x2000;

inline constexpr CMPIType CMPI_SIMPLEA = CMPI_ARRAY | CMPI_SIMPLE;
inline constexpr CMPIType CMPI_REALA = CMPI_ARRAY | CMPI_REAL;
inline constexpr CMPIType CMPI_UINTA = CMPI_ARRAY | CMPI_UINT;
inline constexpr CMPIType CMPI_SINTA = CMPI_ARRAY | CMPI_SINT;
inline constexpr CMPIType CMPI_INTEGERA = CMPI_ARRAY | CMPI_INTEGER;
inline constexpr CMPIType CMPI_ENCA = CMPI_ARRAY | CMPI_ENC;

// -- Plain types --
inline constexpr CMPIType CMPI_boolean = CMPI_SIMPLE | 0x0;
inline constexpr CMPIType CMPI_char16 = CMPI_SIMPLE | 0x1;
inline constexpr CMPIType CMPI_real32 = CMPI_REAL | 0x0;
inline constexpr CMPIType CMPI_real64 = CMPI_REAL | 0x4;

inline constexpr CMPIType CMPI_uint8 = CMPI_UINT | 0x00;
inline constexpr CMPIType CMPI_uint16 = CMPI_UINT | 0x10;
inline constexpr CMPIType CMPI_uint32 = CMPI_UINT | 0x20;
inline constexpr CMPIType CMPI_uint64 = CMPI_UINT | 0x30;
inline constexpr CMPIType CMPI_sint8 = CMPI_SINT | 0x00;
inline constexpr CMPIType CMPI_sint16 = CMPI_SINT | 0x10;
inline constexpr CMPIType CMPI_sint32 = CMPI_SINT | 0x20;
inline constexpr CMPIType CMPI_sint64 = CMPI_SINT | 0x30;

// -- Encapsulated types --
inline constexpr CMPIType CMPI_instance = CMPI_ENC | 0x000;
inline constexpr CMPIType CMPI_ref = CMPI_ENC | 0x100;
inline constexpr CMPIType CMPI_args = CMPI_ENC | 0x200;
inline constexpr CMPIType CMPI_class = CMPI_ENC | 0x300;  // reserved, has no member in CMPIValue
inline constexpr CMPIType CMPI_filter = CMPI_ENC | 0x400;
inline constexpr CMPIType CMPI_enumeration = CMPI_ENC | 0x500;
inline constexpr CMPIType CMPI_string = CMPI_ENC | 0x600;
// Only towards the broker, and there the char pointer takes the place of the CMPIValue pointer.
inline constexpr CMPIType CMPI_chars = CMPI_ENC | 0x700;
inline constexpr CMPIType CMPI_dateTime = CMPI_ENC | 0x800;
inline constexpr CMPIType CMPI_ptr = CMPI_ENC | 0x900;
inline constexpr CMPIType CMPI_charsptr = CMPI_ENC | 0xA00;  // reserved

// -- Arrays --
inline constexpr CMPIType CMPI_booleanA = CMPI_ARRAY | CMPI_boolean;
inline constexpr CMPIType CMPI_char16A = CMPI_ARRAY | CMPI_char16;
inline constexpr CMPIType CMPI_real32A = CMPI_ARRAY | CMPI_real32;
inline constexpr CMPIType CMPI_real64A = CMPI_ARRAY | CMPI_real64;

inline constexpr CMPIType CMPI_uint8A = CMPI_ARRAY | CMPI_uint8;
inline constexpr CMPIType CMPI_uint16A = CMPI_ARRAY | CMPI_uint16;
inline constexpr CMPIType CMPI_uint32A = CMPI_ARRAY | CMPI_uint32;
inline constexpr CMPIType CMPI_uint64A = CMPI_ARRAY | CMPI_uint64;
inline constexpr CMPIType CMPI_sint8A = CMPI_ARRAY | CMPI_sint8;
inline constexpr CMPIType CMPI_sint16A = CMPI_ARRAY | CMPI_sint16;
inline constexpr CMPIType CMPI_sint32A = CMPI_ARRAY | CMPI_sint32;
inline constexpr CMPIType CMPI_sint64A = CMPI_ARRAY | CMPI_sint64;

inline constexpr CMPIType CMPI_instanceA = CMPI_ARRAY | CMPI_instance;
inline constexpr CMPIType CMPI_refA = CMPI_ARRAY | CMPI_ref;
inline constexpr CMPIType CMPI_stringA = CMPI_ARRAY | CMPI_string;
inline constexpr CMPIType CMPI_charsA = CMPI_ARRAY | CMPI_chars;
inline constexpr CMPIType CMPI_dateTimeA = CMPI_ARRAY | CMPI_dateTime;
inline constexpr CMPIType CMPI_charsptrA = CMPI_ARRAY | CMPI_charsptr;

// -- Types that a client's key bindings can have --
inline constexpr CMPIType CMPI_keyInteger = CMPI_sint64;
inline constexpr CMPIType CMPI_keyString = CMPI_string;
inline constexpr CMPIType CMPI_keyBoolean = CMPI_boolean;
inline constexpr CMPIType CMPI_keyRef = CMPI_ref;

// -- What the text on one side of a predicate stands for. Some of these codes coincide --
inline constexpr CMPIType CMPI_charString = CMPI_string;
inline constexpr CMPIType CMPI_integerString = CMPI_string | CMPI_sint64;
inline constexpr CMPIType CMPI_realString = CMPI_string | CMPI_real64;
inline constexpr CMPIType CMPI_numericString = CMPI_string | CMPI_sint64 | CMPI_real64;
inline constexpr CMPIType CMPI_booleanString = CMPI_string | CMPI_boolean;
inline constexpr CMPIType CMPI_dateTimeString = CMPI_string | CMPI_dateTime;
inline constexpr CMPIType CMPI_classNameString = CMPI_string | CMPI_class;
inline constexpr CMPIType CMPI_nameString = CMPI_string | CMPI_charsptr;

// -- Older names of the signed integers and the reals --
inline constexpr CMPIType CMPI_Byte = CMPI_sint8;
inline constexpr CMPIType CMPI_Short = CMPI_sint16;
inline constexpr CMPIType CMPI_Int = CMPI_sint32;
inline constexpr CMPIType CMPI_Long = CMPI_sint64;
inline constexpr CMPIType CMPI_Float = CMPI_real32;
inline constexpr CMPIType CMPI_Double = CMPI_real64;
inline constexpr CMPIType CMPI_ByteA = CMPI_sint8A;
inline constexpr CMPIType CMPI_ShortA = CMPI_sint16A;
inline constexpr CMPIType CMPI_IntA = CMPI_sint32A;
inline constexpr CMPIType CMPI_LongA = CMPI_sint64A;
inline constexpr CMPIType CMPI_FloatA = CMPI_real32A;
inline constexpr CMPIType CMPI_DoubleA = CMPI_real64A;
