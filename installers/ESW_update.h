// System firmware: controller, UEFI, FPGA and diagnostics packages, installed by the management
// controller's software installation service (DMTF DSP1023).
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Has the management controller install the payload of package `idx` and follows its job to the
// end. Returns 0 when it was installed, 1 on every failure.
VELK_API int installESWPkg(int idx, const CMPIContext *context);

// The number that the hexadecimal digits from the third character on spell; the first two stand
// for "0x" and are not looked at. 0 for texts of up to two characters. Characters that are no
// hexadecimal digits count as their distance from '0'; what does not fit 32 bits is lost.
VELK_API int strHexToDec(const char *text);
