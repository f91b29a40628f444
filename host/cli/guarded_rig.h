// A host whose temporary folder no signal leaves behind, and whose libraries print past the
// command.
#pragma once

#include "host/cli/interrupt.h"
#include "host/cli/stdout_capture.h"
#include "host/rig/rig.h"

#include <optional>

namespace velkhost::cli {

class GuardedRig {
  public:
    // `interrupt` must outlive the host. Throws what rig::Rig and StdoutCapture throw.
    GuardedRig(rig::RigOptions options, Interrupt &interrupt);
    ~GuardedRig();
    GuardedRig(const GuardedRig &) = delete;
    GuardedRig &operator=(const GuardedRig &) = delete;

    rig::Rig *operator->() { return &*rig_; }
    const rig::Rig *operator->() const { return &*rig_; }

  private:
    Interrupt &interrupt_;
    std::optional<rig::Rig> rig_;
    std::optional<StdoutCapture> libraries_output_;
};

}  // namespace velkhost::cli
