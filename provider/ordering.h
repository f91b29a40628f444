// The order in which a request's packages are installed.
#pragma once

#include "velk/api.h"

// Writes the first `pkgnum` entries of `PkgSeq`: lowest `OrderFlag` first, of equal ones the
// highest index. Before that each prerequisite that is in the request is put one below the package
// that needs it, and packages whose prerequisite is missing are marked.
VELK_API void OrderPkgInstallation(void);
