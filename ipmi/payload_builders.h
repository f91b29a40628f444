// The typed fields ("elements") of the controller's OEM commands: one header byte with the type in
// its high nibble and a length, then the value. Nothing checks that `out` is large enough.
#pragma once

#include "velk/api.h"

// Header 0x10 with the low nibble of `count`, then the bytes. Returns count + 1.
VELK_API int build_byte_payload(unsigned char *out, const unsigned char *bytes, int count);

// Header 0x40 with the low nibble of the length in bytes, then each value, most significant byte
// first. Returns count * 4 + 1.
VELK_API int build_dword_payload(unsigned char *out, const unsigned int *values, int count);

// Header 0x80 with the text's length, then the characters and a terminator that is not counted.
// Returns length + 1; writes one byte more.
VELK_API int build_string_payload(unsigned char *out, const char *text);
