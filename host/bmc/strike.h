// What a fault makes of the controller's answer.
#pragma once

#include "host/bmc/message.h"
#include "host/scenario/fault_rules.h"

#include <string>

namespace velkhost::bmc {

// Whether the request is served although the fault strikes: only its answer suffers.
bool reaches_the_controller(const scenario::Fault &fault);

// Changes `reply`, whose response is the one without the fault, or the refusal where the request
// does not reach the controller. Returns the words for the trace instead of `words`.
std::string strike(const scenario::Fault &fault, Reply &reply, const std::string &words);

}  // namespace velkhost::bmc
