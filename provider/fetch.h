// Making a package's files readable on the host, and having transferred ones removed again.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Makes the file at `sourceURI` available for package `idx` in the way that the request's location
// kind asks for, and stores its local location in `LocalPkgURI`. Returns 0 when it cannot be used.
VELK_API int GetFileFromLocalOrTFTP(const char *sourceURI, int idx, const CMPIContext *context);

// Asks the file transfer service to delete `fileURI`. The outcome is only logged.
VELK_API void deleteTransferedFile(const char *fileURI, const CMPIContext *context);
