// Which installer a package goes to.
#pragma once

#include "velk/api.h"
#include "velk/package_table.h"

// Chooses the installer of package `idx` by its `category` and `Name` and stores it in the record,
// null when none fits.
VELK_API void getPkgProviderName(int idx);

// Chooses the installer anew and runs it. Returns its result, or -1 when none fits; the package's
// status is then not touched.
VELK_API int DeployUpdate(int idx, const CMPIContext *context);
