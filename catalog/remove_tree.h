// Recursive removal of work directories.
#pragma once

#include "velk/api.h"

// Removes a file, a symbolic link itself or a directory with all that it holds, depth first.
// Returns 0 when it is gone, 1 when it did not exist, -1 when a directory could not be opened,
// closed or removed, -2 when anything else could not be unlinked; a negative result ends the walk.
// A directory whose last entry vanished meanwhile gives 1 as well.
VELK_API int util_remove_file(const char *path);

// Joins `dir` and `name` with exactly one "/" into `out`, cut to `size` bytes with the terminator.
// Returns the length that the full name needs.
VELK_API int util_full_name(const char *dir, const char *name, char *out, int size);
