// Pauses on the host's clock.
#pragma once

#include <cstdint>
#include <stop_token>

namespace velkhost::providers {

// Pauses, but not much longer than a second once `stop` is requested.
void host_pause(std::int64_t micros, const std::stop_token &stop);

// A thread takes part in a simulated clock from its first pause on; this is a pause of no length.
// From here to its end the clock stands still unless the thread pauses.
void take_part_in_host_time();

}  // namespace velkhost::providers
