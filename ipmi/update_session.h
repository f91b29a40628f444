// The option-firmware update session: the controller is told that an adapter is being flashed from
// the host, asked about it while that lasts, and told when it is over. The log calls it "SMM".
#pragma once

#include "velk/api.h"

// Opens a session; `*handle` must be -1. Returns 0 when the update has begun, and the channel then
// stays open, or when the controller knows no sessions; else a negative code:
//   -1   the type query failed, or a first-generation controller
//   -2   the device could not be opened, or create, open or begin failed
//   -12  the secure mode could not be read
VELK_API int start_update_option_firmware(int *handle);

// Asks for the session's status once. Returns 0 or a negative code. When the controller answers
// that the operation failed, the channel is left open.
VELK_API int get_flash_status(int handle);

// Cancels, closes and destroys the session's transaction, with pauses of 10 seconds (70 after a
// failure) that the controller needs.
VELK_API void smm_disconnect(int *handle);
