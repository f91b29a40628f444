// The fault hook: asks whether a step of the shim shall fail, and how.
#pragma once

#include <string_view>

#include "host/shim/hook.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {

extern Hook<int(void *, const char *)> fault_hook;

// The errno with which the step "verb:subject" shall fail, or 0. Without a subject the step is the
// verb alone.
int fault_at(std::string_view verb, std::string_view subject = {});

}  // namespace velkhost::shim
