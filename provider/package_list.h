// The start of every request: from the list of locations to package records.
#pragma once

#include "velk/api.h"

// Fills one record per "|"-separated location of `uriList`, at most 20, and sets `pkgnum`,
// `filelocation` and `totalstatus`. Only record 0 is cleared; in the others a location shorter
// than the one of a former request keeps that one's tail. Locations are cut at 199 characters.
// Returns 0.
VELK_API int initPkgInstall(const char *uriList);
