// Brocade Fibre Channel adapters, through the Brocade provider in root/brocade.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Returns 0.
VELK_API int installBrocadePkg(int idx, const CMPIContext *context);

// Fills `DFNDeviceIDArray` with the ports whose name is a physical package's serial number. The
// ports are enumerated once and walked once, so that only those of the first package are found.
VELK_API void getBrocadeDFNDeviceIDArray(int idx, const CMPIContext *context);

// Installs the payloads in turn; returns the first result other than 0, or 0.
VELK_API int installBrcdFCpayload(int idx, const CMPIContext *context);

// Returns what the vendor's InstallFromURI returned, 1 when an object path could not be built, 4098
// when the call failed.
VELK_API int installSingleBrcdFCpayload(const CMPIContext *context, const char *payloadPath,
                                        const char *deviceID);

// The session watcher of this family.
VELK_API void *query_fw_update_brocade(void *block);
VELK_API int querysmm_brocade(int sessionValue);
