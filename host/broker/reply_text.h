// Replies as the trace shows them.
#pragma once

#include "host/broker/dispatch.h"

#include <string>

namespace velkhost::broker {

std::string result_text(const ObjectsReply &reply);
std::string result_text(const MethodReply &reply);

}  // namespace velkhost::broker
