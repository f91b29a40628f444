// The loop that carries one request from a filled package table to installed packages.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Fetches and reads every descriptor, orders the packages, and fetches and installs each in turn.
// `context` is the calling thread's own. Returns the result of the last installer, 1 when none ran.
VELK_API int syncInstallAllPkgs(const CMPIContext *context);
