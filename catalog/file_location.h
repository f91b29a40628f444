// A location text that the library keeps for other modules of the host; nothing in here reads it.
#pragma once

#include "velk/api.h"

// Stores at most 1024 characters of `text` (null: none) at the start of `update_file_location` and
// a 32-bit zero at its offset 4096. Returns 0.
VELK_API int SetFileLocation(const char *text);

// `update_file_location`, owned by the library.
VELK_API char *GetFileLocation(void);
