// Asking providers to go.
#pragma once

#include "host/broker/broker.h"

#include <optional>

namespace velkhost::broker {

// Asks the clean-ups of a loaded provider. No value when it is not asked: it is not loaded, is
// registered with "unload: never", or has said 51 before.
std::optional<UnloadAnswer::Decision> ask_to_unload(Core &core, Provider &provider);

// Calls every clean-up of a loaded provider with the broker's end as the reason.
void tell_shutdown(Core &core, Provider &provider);

}  // namespace velkhost::broker
