// What the two maintenance methods do.
#pragma once

#include "velk/api.h"

// Deletes the debug log; a new one then begins with a line that says so. Returns 1 when it was
// deleted, 0 when not.
VELK_API int DeleteVelkDebugLog(void);

// Removes the file store /var/tmp/filestore and the lock marker /tmp/sfcb/velk.safelock. Returns 1
// when the marker was deleted, 0 when not.
VELK_API int reset_cimmon(void);
