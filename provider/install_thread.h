// The detached thread that runs one accepted request.
#pragma once

#include <cmpi/cmpidt.h>

#include "velk/api.h"

namespace velk {

// Lives in the frame of the call that starts the thread.
struct AsyncInstallArg {
    int job_number;
    const CMPIContext *context;
};

}  // namespace velk

// Thread body; `arg` is a velk::AsyncInstallArg, read before the first pause. Returns null.
VELK_API void *asyncInstallAllPkgs(void *arg);
