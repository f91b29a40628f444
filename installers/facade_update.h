// Broadcom and LSI adapters, through the update providers "BRCMFWUP" and "TAVU". Their services
// take the whole unpacked directory and pick their own targets, so nothing is discovered or
// matched.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Return 0.
VELK_API int installBroadcomPkg(int idx, const CMPIContext *context);
VELK_API int installLSIPkg(int idx, const CMPIContext *context);

VELK_API int installBroadcompayload(int idx, const CMPIContext *context, const char *directory);
VELK_API int installLSIpayload(int idx, const CMPIContext *context, const char *directory);

// Starts the update and asks for its status every 10 seconds until it is done. Returns 0 then, 1
// when the service path could not be built, 4098 when the call failed or started no job, else the
// final status, -1 when the service no longer tells one.
VELK_API int installSingleBroadcompayload(const CMPIContext *context, const char *directory);

// Returns what the vendor's InstallFromURI returned, 1 when the service path could not be built,
// 4098 when the call failed.
VELK_API int installSingleLSIpayload(const CMPIContext *context, const char *directory);

// The session watcher of both families.
VELK_API void *query_fw_update_facade(void *block);
VELK_API int querysmm_facade(int sessionValue);
