// Emulex adapters: Fibre Channel ("ELXHBA") and converged network ("ELXUCNA"), through the Emulex
// provider in root/emulex. Each kind has its installer, discovery, payload loop and single payload.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// The installers return the result of removing the unpacked files, 4098 when no adapter was found,
// 0 when the package could not be unpacked or matched.
VELK_API int installElxFCPkg(int idx, const CMPIContext *context);
VELK_API int installElxCNAPkg(int idx, const CMPIContext *context);

// Fill `DFNDeviceIDArray` and `dfnnumber`: for Fibre Channel from the ports' vital product data,
// for converged adapters from the part number of the card behind the first port of each.
VELK_API void get_elxfc_dfn_devid(int idx, const CMPIContext *context);
VELK_API void get_elxcna_dfn_devid(int idx, const CMPIContext *context);

// Install the payloads in turn; return the first result other than 0, or 0.
VELK_API int install_elxfc_payload(int idx, const CMPIContext *context);
VELK_API int install_elxcna_payload(int idx, const CMPIContext *context);

// Return what the vendor's InstallFromURI returned, 1 when an object path could not be built, 4098
// when the call failed.
VELK_API int install_one_elxfc_payload(const CMPIContext *context, const char *payloadPath,
                                       const char *deviceID);
VELK_API int install_one_elxcna_payload(const CMPIContext *context, const char *payloadPath,
                                        const char *deviceID);

// The session watcher of this family.
VELK_API void *query_fw_update_emulex(void *block);
VELK_API int querysmm_emulex(int sessionValue);
