#include "provider/maintenance.h"

#include <unistd.h>

#include "catalog/remove_tree.h"
#include "provider/work_area.h"
#include "velk/debug_log.h"

int DeleteVelkDebugLog(void) {
    velk::log_entry("Delete the velk debug log file.\n");
    if (unlink(velk::kDebugLog) != 0) {
        velk::log_entry("Fail to delete velk debug log file.\n");
        return 0;
    }
    velk::log_value("Successfully to delete ", velk::kDebugLog);
    return 1;
}

int reset_cimmon(void) {
    velk::log_entry("Delete the files that left after update.\n");
    // A file store that does not exist counts as a failure here, too.
    const bool removed = util_remove_file(velk::kFileStore) == 0;
    velk::log_entry(removed ? "Successfully to delete files under filestore.\n"
                            : "Fail to delete files under filestore.\n");
    if (unlink(velk::kLockMarker) != 0) {
        velk::log_entry("Fail to delete VELK_LOCK_FILE.\n");
        return 0;
    }
    velk::log_value("Successfully to delete ", velk::kLockMarker);
    return 1;
}
