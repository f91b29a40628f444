// Client of the host's file transfer service, class ZEB_FileTransferService in zeb/cimv2.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Both have the service fetch `sourceURI` for package `idx` and store the location that it reports
// in `LocalPkgURI`; progress and failures are reported as the package's status. Return 1 when the
// file was fetched, else 0. TFTP answers when the transfer is over, SFTP starts a job that is then
// polled every 10 seconds for as long as it runs.
VELK_API int downloadFileViaTFTP(const char *sourceURI, int idx, const CMPIContext *context);
VELK_API int downloadFileViaSFTP(const char *sourceURI, int idx, const CMPIContext *context);
