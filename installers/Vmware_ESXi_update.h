// Hypervisor bundles, installed by the hypervisor's own software installation provider in
// root/cimv2 from where they lie: nothing is fetched here.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

// Appends the name of the bundle's metadata file to `TFTPPayloadPkgURIs` of package `idx`, for
// good, has the provider install from there and follows its job. Returns 1 when the bundle was
// installed or had nothing to install, 0 on every failure.
VELK_API int installVMPkg(int idx, const CMPIContext *context);
