#include "host/cli/guarded_rig.h"

#include <utility>

namespace velkhost::cli {

GuardedRig::GuardedRig(rig::RigOptions options, Interrupt &interrupt) : interrupt_(interrupt) {
    // Made and known in one step, so that no signal finds a folder that nobody removes.
    const auto held = interrupt_.hold();
    rig_.emplace(std::move(options));
    interrupt_.add([folder = rig_->folder().path(), temporary = rig_->folder().is_temporary()] {
        if (temporary) {
            rig::remove_folder(folder);
        }
    });
    libraries_output_.emplace(rig_->folder().inside(kBrokerOutput));
}

GuardedRig::~GuardedRig() {
    const auto held = interrupt_.hold();
    libraries_output_.reset();
    rig_.reset();
    interrupt_.drop();
}

}  // namespace velkhost::cli
