// Contexts: the entries that a request travels with.
#pragma once

#include "host/broker/api.h"
#include "host/broker/payloads.h"

#include <cmpi/cmpidt.h>

#include <string_view>

namespace velkhost::broker {

void set_entry(ContextPayload &entries, std::string_view name, cim::Value value);
const cim::Value *find_entry(const ContextPayload &entries, std::string_view name);

// A context that outlives the request and may be used by any thread; its taker releases it, or
// detachThread does. Null for what is no context.
CMPIContext *clone_context(const CMPIContext *context);

}  // namespace velkhost::broker

// What brokers of the sfcb kind offer in place of the context's clone slot. Not in any header of
// the standard; providers declare it themselves.
extern "C" VELKBROKER_API CMPIContext *native_clone_CMPIContext(const CMPIContext *context);
