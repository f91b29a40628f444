// QLogic adapters, network ("NIC") and Fibre Channel ("FCHBA"), through the QLogic provider in
// qlogic/cimv2. The adapters are walked one by one; the service runs each update as a job.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Returns 0.
VELK_API int installQlgPkg(int idx, const CMPIContext *context);

// Sets `dfnnumber` to the number of QLogic adapters, 0 when they cannot be enumerated.
VELK_API void getQlgPhysicalAdapterCount(int idx, const CMPIContext *context);

// Install the payloads in turn through a port controller; return 0, or 1 at the first failure.
VELK_API int installQlgNICpayload(int idx, const CMPIContext *context,
                                  const CMPIInstance *portController);
VELK_API int installQlgFCpayload(int idx, const CMPIContext *context,
                                 const CMPIInstance *portController);

// Return 0 when the job completed, 1 when an object path could not be built, 4098 when no job was
// started, 10 when the job ended in any other state.
VELK_API int installSingleQlgNICpayload(const CMPIContext *context, const char *payloadPath,
                                        const CMPIInstance *portController);
VELK_API int installSingleQlgFCpayload(const CMPIContext *context, const char *payloadPath,
                                       const CMPIInstance *portController);

// The session watcher of this family.
VELK_API void *query_fw_update_qlogic(void *block);
VELK_API int querysmm_qlogic(int sessionValue);
