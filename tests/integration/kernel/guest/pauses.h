// How long the library wanted to pause.
#pragma once

namespace velkguest {

// Seconds of all calls of sleep() since the last look.
unsigned take_paused_seconds();

// Returns when other threads have begun so many pauses more.
void wait_for_pauses(unsigned count);

}  // namespace velkguest
